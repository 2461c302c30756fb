#include <algorithm>

#include "Fendle/AutoCli.h"
#include "HostCtl/Lib.h"

namespace Fendle {
namespace AutoCli {

namespace {

[[noreturn]] void Refuse(const std::string& text) {
  throw HostCtl::Lib::HostCtlException(text, HostCtl::Lib::KelmMessage());
}

// How a node is named in messages: its path, or its own name for a root.
std::string Describe(const NamespaceNode& node) {
  std::string path = node.GetPathString(' ');
  return path.empty() ? node.GetName() : path;
}

}  // namespace

NamespaceNode::~NamespaceNode() = default;

boost::shared_ptr<NamespaceNode> NamespaceNode::GetThis() { return shared_from_this(); }

std::string NamespaceNode::GetName() const { return name_; }

void NamespaceNode::SetName(const std::string& name) { name_ = name; }

std::string NamespaceNode::GetDescription() const { return description_; }

void NamespaceNode::SetDescription(const std::string& description) { description_ = description; }

std::vector<std::string> NamespaceNode::GetPath() const {
  // The root itself has no parent and is not part of any path.
  std::vector<std::string> path;
  const NamespaceNode* node = this;
  boost::shared_ptr<NamespaceNode> parent = node->GetParent();
  while (parent) {
    path.push_back(node->GetName());
    node = parent.get();
    parent = node->GetParent();
  }
  std::reverse(path.begin(), path.end());
  return path;
}

std::string NamespaceNode::GetPathString(char separator) const {
  std::string joined;
  for (const std::string& word : GetPath()) {
    if (!joined.empty()) joined += separator;
    joined += word;
  }
  return joined;
}

bool NamespaceNode::HasNamespaceNode(const std::string& name) const {
  return static_cast<bool>(GetNamespaceNode(name));
}

std::vector<std::string> NamespaceNode::GetNamespaceNodeNames() const {
  std::vector<std::string> names;
  names.reserve(children_.size());
  for (const auto& child : children_) names.push_back(child.first);
  return names;
}

std::vector<boost::shared_ptr<NamespaceNode> > NamespaceNode::GetNamespaceNodes() const {
  std::vector<boost::shared_ptr<NamespaceNode> > nodes;
  nodes.reserve(children_.size());
  for (const auto& child : children_) nodes.push_back(child.second);
  return nodes;
}

boost::shared_ptr<NamespaceNode> NamespaceNode::GetNamespaceNode(const std::string& name) const {
  for (const auto& child : children_) {
    if (child.first == name) return child.second;
  }
  return boost::shared_ptr<NamespaceNode>();
}

void NamespaceNode::RegisterNamespaceNode(const boost::shared_ptr<NamespaceNode>& node,
                                          const std::string& name) {
  // Every check comes before the first change, so a refusal leaves both nodes as they were.
  if (!node) Refuse("Cannot register an empty node as '" + name + "' in '" + Describe(*this) + "'");
  if (name.empty()) Refuse("Cannot register a node without a name in '" + Describe(*this) + "'");
  if (HasNamespaceNode(name)) {
    Refuse("Cannot register '" + name + "' in '" + Describe(*this) +
           "': the name is already taken");
  }
  if (node->GetParent()) {
    Refuse("Cannot register '" + name + "' in '" + Describe(*this) +
           "': the node is already registered as '" + Describe(*node) + "'");
  }
  // Hanging a node under itself or under its own descendant would make a cycle
  // that owns itself and never ends a path walk.
  for (const NamespaceNode* ancestor = this; ancestor != nullptr;
       ancestor = ancestor->GetParent().get()) {
    if (ancestor == node.get()) {
      Refuse("Cannot register '" + name + "' in '" + Describe(*this) +
             "': a node cannot be placed below itself");
    }
  }
  boost::shared_ptr<NamespaceNode> self = GetThis();
  children_.emplace_back(name, node);
  node->SetName(name);
  node->SetParent(self);
}

boost::shared_ptr<NamespaceNode> NamespaceNode::ResolveNode(std::vector<std::string>& words) {
  boost::shared_ptr<NamespaceNode> node = GetThis();
  std::size_t used = 0;
  while (used < words.size()) {
    boost::shared_ptr<NamespaceNode> child = node->GetNamespaceNode(words[used]);
    if (!child) break;
    node = child;
    ++used;
  }
  words.erase(words.begin(), words.begin() + static_cast<std::ptrdiff_t>(used));
  return node;
}

void NamespaceNode::SetParent(const boost::shared_ptr<NamespaceNode>& parent) { parent_ = parent; }

boost::shared_ptr<NamespaceNode> NamespaceNode::GetParent() const { return parent_.lock(); }

// Namespace

boost::shared_ptr<Namespace> Namespace::New() {
  return boost::shared_ptr<Namespace>(new Namespace());
}

NodeType Namespace::GetType() const { return NodeType::Namespace; }

}  // namespace AutoCli
}  // namespace Fendle

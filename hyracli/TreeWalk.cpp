#include "hyracli/TreeWalk.h"

#include <boost/pointer_cast.hpp>

namespace Hyracli {

void VisitTree(const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root,
               const NodeVisitor& visit) {
  visit(root);
  for (const auto& child : root->GetNamespaceNodes()) VisitTree(child, visit);
}

boost::shared_ptr<Fendle::AutoCli::Command> AsCommand(
    const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& node) {
  if (node->GetType() != Fendle::AutoCli::NodeType::Command) return nullptr;
  return boost::dynamic_pointer_cast<Fendle::AutoCli::Command>(node);
}

}  // namespace Hyracli

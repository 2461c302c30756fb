// The command tree of the host tool: namespaces group named children, commands
// are the leaves. Plug-ins hang their subtrees into it from their exported entry
//
//   extern "C" void AutoCli_RegisterNamespaces(
//       boost::shared_ptr<Fendle::AutoCli::Namespace>& root);
//
// which the host calls once after loading the plug-in.
#pragma once

#include "Fendle/CallSpec.h"
#include "Fendle/MetaObj.h"

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <string>
#include <utility>
#include <vector>

namespace Fendle {
namespace AutoCli {

enum class NodeType : int { Namespace = 0, Command = 1 };

// The common node of the tree: a name (given when it is registered under its
// parent), a description, a parent and named children in registration order.
class NamespaceNode : public virtual boost::enable_shared_from_this<NamespaceNode> {
 public:
  virtual ~NamespaceNode();

  virtual boost::shared_ptr<NamespaceNode> GetThis();
  virtual NodeType GetType() const = 0;
  virtual std::string GetName() const;
  virtual void SetName(const std::string& name);
  virtual std::string GetDescription() const;
  virtual void SetDescription(const std::string& description);
  // The names from the root's child down to this node.
  virtual std::vector<std::string> GetPath() const;
  // The path joined with the separator.
  virtual std::string GetPathString(char separator) const;

  virtual bool HasNamespaceNode(const std::string& name) const;
  // Child names in registration order.
  virtual std::vector<std::string> GetNamespaceNodeNames() const;
  // Children in registration order.
  virtual std::vector<boost::shared_ptr<NamespaceNode> > GetNamespaceNodes() const;
  // The child of that name, or an empty pointer.
  virtual boost::shared_ptr<NamespaceNode> GetNamespaceNode(const std::string& name) const;
  // Hangs node under this one as name and makes this its parent. Throws
  // HostCtl::Lib::HostCtlException when the name is taken or the node has a
  // parent already; nothing changes then.
  virtual void RegisterNamespaceNode(const boost::shared_ptr<NamespaceNode>& node,
                                     const std::string& name);
  // Walks the words down from this node as far as they name children; answers
  // the deepest node reached and removes the words used from the front.
  virtual boost::shared_ptr<NamespaceNode> ResolveNode(std::vector<std::string>& words);

  virtual void SetParent(const boost::shared_ptr<NamespaceNode>& parent);
  // The parent, or an empty pointer for a root or a node not registered yet.
  virtual boost::shared_ptr<NamespaceNode> GetParent() const;

 protected:
  NamespaceNode() = default;

 private:
  std::string name_;
  std::string description_;
  boost::weak_ptr<NamespaceNode> parent_;
  std::vector<std::pair<std::string, boost::shared_ptr<NamespaceNode> > > children_;
};

// A node that only groups children.
class Namespace : public virtual NamespaceNode {
 public:
  static boost::shared_ptr<Namespace> New();
  NodeType GetType() const override;

 protected:
  Namespace() = default;
};

// A leaf of the tree that can be executed. Subclasses declare their input and
// output in GetInputSpecInternal and GetOutputSpecInternal and do the work in
// ExecuteInternal; the public CallTarget operations forward to them.
class Command : public virtual NamespaceNode, public virtual CallSpec::CallTarget {
 public:
  ~Command() override;

  boost::shared_ptr<CallSpec::InputSpec> GetInputSpec() override;
  boost::shared_ptr<CallSpec::OutputSpec> GetOutputSpec() override;
  void Execute(const boost::shared_ptr<CallSpec::Input>& input,
               const boost::shared_ptr<CallSpec::Output>& output) override;
  NodeType GetType() const override;

  typedef std::vector<std::pair<std::string, std::string> > Pairs;

  // Usage examples as (command line, explanation), in the order added.
  virtual const Pairs& GetExamples() const;
  virtual void AddExample(const std::string& commandLine, const std::string& explanation);

  // The default formatter name, or an empty text when none was set.
  virtual std::string GetDefaultOutputFormatter() const;
  virtual void SetDefaultOutputFormatter(const std::string& formatter);
  // Formatter hints as (key, value) in the order first set; setting a key
  // again replaces its value in place.
  virtual const Pairs& GetDefaultOutputFormatParameters() const;
  virtual void SetDefaultOutputParameter(const std::string& key, const std::string& value);

  virtual void SetMetaDataField(const std::string& key, const std::string& value);
  // The value of a metadata field, or an empty text.
  virtual std::string GetMetaDataField(const std::string& key) const;
  virtual const Pairs& GetMetaData() const;

  // The help text of this command: its description and every parameter.
  virtual std::string GenerateHelpOutput();

 protected:
  Command() = default;

  virtual boost::shared_ptr<CallSpec::InputSpec> GetInputSpecInternal();
  virtual boost::shared_ptr<CallSpec::OutputSpec> GetOutputSpecInternal();
  // The framework's default reports that the command does nothing.
  virtual void ExecuteInternal(const boost::shared_ptr<CallSpec::Input>& input,
                               const boost::shared_ptr<CallSpec::Output>& output);

 private:
  Pairs examples_;
  std::string formatter_;
  Pairs formatParameters_;
  Pairs metaData_;
};

}  // namespace AutoCli
}  // namespace Fendle

// Walks the command tree for the generators that describe it (completion
// scripts, manual pages), so they list the same nodes in the same order.
#pragma once

#include <boost/shared_ptr.hpp>
#include <functional>

#include "Fendle/AutoCli.h"

namespace Hyracli {

typedef std::function<void(const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>&)> NodeVisitor;

// Calls visit for root and then every node below it, depth first, children in
// registration order.
void VisitTree(const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root,
               const NodeVisitor& visit);

// The node as a runnable command, or an empty pointer for a namespace (or a
// node that claims to be a command but is not one).
boost::shared_ptr<Fendle::AutoCli::Command> AsCommand(
    const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& node);

}  // namespace Hyracli

// Shell completion scripts for hyracli, generated from the tree the loaded
// plug-ins registered: namespaces, commands, each command's options and their
// aliases, true/false for Bool options, the global options and the formatter
// names. A new command therefore completes without anyone editing a script.
#pragma once

#include <boost/shared_ptr.hpp>
#include <ostream>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"

namespace Hyracli {

// The shells a script can be written for: bash, zsh and fish.
const std::vector<std::string>& CompletionShells();

// Writes the completion script of shell for the tree below root; false (and
// nothing written) for a shell not in CompletionShells().
bool WriteCompletionScript(const std::string& shell,
                           const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root,
                           std::ostream& out);

// "hyracli completion SHELL": args are the words after "completion". Answers
// the exit status; "--help" among them prints the usage, a missing or
// unknown shell is a usage error.
int RunCompletion(const std::vector<std::string>& args,
                  const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root, std::ostream& out,
                  std::ostream& err);

}  // namespace Hyracli

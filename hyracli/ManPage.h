// Manual pages for hyracli, generated from the same declarations its --help
// shows: hyracli(1) with the global options and every command, and one page
// per command with its description and every parameter (alias, type, required,
// help), the exit statuses and the environment.
#pragma once

#include <boost/shared_ptr.hpp>
#include <ostream>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"

namespace Hyracli {

// What the page footers and headers carry.
struct ManPageInfo {
  std::string date;     // YYYY-MM-DD
  std::string version;  // the tool's version
};

// "hyracli" for the root, else "hyracli-" and the node's path joined by dashes
// ("hyracli-storage-internal-tarn-kiroprovider-add").
std::string ManPageName(const Fendle::AutoCli::NamespaceNode& node);

// The page of the tool: synopsis, global options, every command, exit statuses, environment.
void WriteToolManPage(const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root,
                      const ManPageInfo& info, std::ostream& out);

// The page of one command.
void WriteCommandManPage(Fendle::AutoCli::Command& command, const ManPageInfo& info,
                         std::ostream& out);

// Writes NAME.1 for the tool and for each command below root into directory,
// which must exist; answers the file names in tree order. Throws
// std::runtime_error when a page cannot be written.
std::vector<std::string> WriteManPages(const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root,
                                       const std::string& directory, const ManPageInfo& info);

}  // namespace Hyracli

// The hyracli tool: global options, resolving the command words in the tree,
// help, running a command and rendering what it answers.
#pragma once

#include <boost/shared_ptr.hpp>
#include <ostream>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"
#include "hyracli/PluginLoader.h"

namespace Hyracli {

// Exit statuses of the tool.
enum ExitStatus : int {
  kExitOk = 0,
  kExitCommandFailed = 1,  // the command reported an error, threw, or ended without result
  kExitUsage = 2,          // the command line could not be run as written
  kExitPlugin = 3,         // a plug-in could not be loaded or registered
};

// The options before the command words (--formatter may also follow them).
struct GlobalOptions {
  std::string formatter;        // empty: the command's default
  std::string pluginDirectory;  // empty: not given
  bool help = false;
  bool version = false;
  std::vector<std::string> words;  // the command words and the command's own arguments
};

// Throws Fendle::CommandLine::UsageError for an unknown or repeated option, a
// missing value or an unknown formatter. A first word "help" asks for help.
GlobalOptions ParseGlobalOptions(const std::vector<std::string>& args);

// The tool's version line, then one line per plug-in: file name and version.
void WriteVersions(const std::vector<PluginVersion>& plugins, std::ostream& out);

// The tool's own tree: the root "hyracli" holding an empty "storage".
boost::shared_ptr<Fendle::AutoCli::Namespace> NewRootNamespace();

// Shows help for, or runs, what options.words name below root; answers the exit status.
int Dispatch(const GlobalOptions& options,
             const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root, std::ostream& out,
             std::ostream& err);

// ParseGlobalOptions and Dispatch on a tree built by the caller; --plugin-dir
// is accepted and not used.
int Run(const std::vector<std::string>& args,
        const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root, std::ostream& out,
        std::ostream& err);

// The whole tool: options, plug-ins, then Dispatch on the tool's own tree.
// Output that cannot be written (a full disk) fails the run with a message.
int Main(const std::vector<std::string>& args, std::ostream& out, std::ostream& err);

}  // namespace Hyracli

// hyracli-manpages: writes the manual pages of hyracli and of every command
// the plug-ins register, at build time.
//
//   hyracli-manpages DIRECTORY DATE VERSION [PLUGIN-DIRECTORY]
#include <boost/shared_ptr.hpp>
#include <exception>
#include <iostream>
#include <string>

#include "hyracli/HyraCli.h"
#include "hyracli/ManPage.h"
#include "hyracli/PluginLoader.h"

int main(int argc, char** argv) {
  if (argc < 4 || argc > 5) {
    std::cerr << "Usage: hyracli-manpages DIRECTORY DATE VERSION [PLUGIN-DIRECTORY]\n";
    return Hyracli::kExitUsage;
  }
  try {
    // Declared before the tree so that it is destroyed after it, as in hyracli.
    Hyracli::PluginLoader loader;
    boost::shared_ptr<Fendle::AutoCli::Namespace> root = Hyracli::NewRootNamespace();
    loader.LoadDirectory(Hyracli::PluginDirectory(argc == 5 ? argv[4] : ""), root);
    Hyracli::WriteManPages(root, argv[1], Hyracli::ManPageInfo{argv[2], argv[3]});
  } catch (const std::exception& e) {
    std::cerr << "hyracli-manpages: " << e.what() << "\n";
    return Hyracli::kExitCommandFailed;
  } catch (...) {
    std::cerr << "hyracli-manpages: a command failed while its page was written\n";
    return Hyracli::kExitCommandFailed;
  }
  return Hyracli::kExitOk;
}

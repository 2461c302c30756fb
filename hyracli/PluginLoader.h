// Loads the tool's plug-ins and lets each hang its commands into the tree
// through its entry
//
//   extern "C" void AutoCli_RegisterNamespaces(
//       boost::shared_ptr<Fendle::AutoCli::Namespace>& root);
#pragma once

#include <boost/shared_ptr.hpp>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"

namespace Hyracli {

// A plug-in that could not be loaded or registered; the message says which and why.
class PluginError : public std::runtime_error {
 public:
  explicit PluginError(const std::string& message);
  ~PluginError() override;
};

// A loaded plug-in: its file name and the version it was built with (empty
// when the library carries none).
struct PluginVersion {
  std::string name;
  std::string version;
};

// Owns the loaded libraries. The tree that plug-ins filled holds objects whose
// code lives in them, so it must be dropped before the loader.
class PluginLoader {
 public:
  PluginLoader() = default;
  // Unloads in the reverse order of loading.
  ~PluginLoader();
  PluginLoader(const PluginLoader&) = delete;
  PluginLoader& operator=(const PluginLoader&) = delete;

  // Loads every regular file named "*.plugin.so" in directory, in name order,
  // and registers each with root. Stops at the first failure with a PluginError;
  // what was loaded stays loaded.
  void LoadDirectory(const std::string& directory,
                     boost::shared_ptr<Fendle::AutoCli::Namespace>& root);
  // Loads one library and calls its entry with root.
  void Load(const std::string& path, boost::shared_ptr<Fendle::AutoCli::Namespace>& root);

  // The plug-ins registered so far, in loading order.
  const std::vector<PluginVersion>& Versions() const;

 private:
  struct Closer {
    void operator()(void* handle) const;
  };
  std::vector<std::unique_ptr<void, Closer> > handles_;
  std::vector<PluginVersion> versions_;
};

// The version a plug-in library carries in its ELF note "Hyracli" of type 1
// (a NUL-terminated text), read from the loaded image of handle; empty when
// it has none.
std::string LoadedVersion(void* handle);

// The plug-in directory: given when not empty, else $HYRACLI_PLUGIN_DIR when
// set and not empty, else ../lib/hyracli/plugins from the running executable's
// directory (the same in the build tree and in an installed one).
std::string PluginDirectory(const std::string& given);

// The default plug-in directory relative to the executable's ("../lib/hyracli/plugins").
const char* PluginSubdirectory();

}  // namespace Hyracli

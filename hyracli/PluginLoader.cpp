#include "hyracli/PluginLoader.h"

#include <dlfcn.h>
#include <link.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <system_error>

#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"

namespace Hyracli {

namespace {

typedef void (*RegisterEntry)(boost::shared_ptr<Fendle::AutoCli::Namespace>&);

const char kEntryName[] = "AutoCli_RegisterNamespaces";
const char kSuffix[] = ".plugin.so";

bool IsPluginName(const std::string& name) {
  const std::size_t suffix = sizeof(kSuffix) - 1;
  return name.size() > suffix && name.compare(name.size() - suffix, suffix, kSuffix) == 0;
}

// Calls the entry and turns whatever it throws into a PluginError; for an
// OskCtlException the thrower's source and line help find the cause.
void Register(RegisterEntry entry, const std::string& path,
              boost::shared_ptr<Fendle::AutoCli::Namespace>& root) {
  const std::string prefix = "Cannot register plug-in " + path + ": ";
  try {
    entry(root);
  } catch (const OskCtl::Lib::OskCtlException& e) {
    throw PluginError(prefix + e.GetMessage() + " (" + e.GetSourceFile() + ":" +
                      std::to_string(e.GetLine()) + ")");
  } catch (const HostCtl::Lib::HostCtlException& e) {
    throw PluginError(prefix + e.GetMessage());
  } catch (const std::exception& e) {
    throw PluginError(prefix + e.what());
  } catch (...) {
    throw PluginError(prefix + "unknown exception");
  }
  if (!root) throw PluginError(prefix + "the plug-in dropped the root namespace");
}

}  // namespace

PluginError::PluginError(const std::string& message) : std::runtime_error(message) {}

PluginError::~PluginError() = default;

void PluginLoader::Closer::operator()(void* handle) const { dlclose(handle); }

PluginLoader::~PluginLoader() {
  while (!handles_.empty()) handles_.pop_back();
}

void PluginLoader::LoadDirectory(const std::string& directory,
                                 boost::shared_ptr<Fendle::AutoCli::Namespace>& root) {
  namespace fs = std::filesystem;
  std::error_code error;
  fs::directory_iterator entries(directory, error);
  if (error) {
    throw PluginError("Cannot read plug-in directory " + directory + ": " + error.message());
  }
  std::vector<std::string> names;
  for (const fs::directory_entry& entry : entries) {
    std::string name = entry.path().filename().string();
    std::error_code status_error;
    // status() follows links, so a link to a library counts as the library.
    if (IsPluginName(name) && fs::is_regular_file(entry.status(status_error))) {
      names.push_back(name);
    }
  }
  std::sort(names.begin(), names.end());
  for (const std::string& name : names) Load((fs::path(directory) / name).string(), root);
}

void PluginLoader::Load(const std::string& path,
                        boost::shared_ptr<Fendle::AutoCli::Namespace>& root) {
  dlerror();
  std::unique_ptr<void, Closer> handle(dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL));
  if (!handle) {
    const char* reason = dlerror();
    throw PluginError("Cannot load plug-in " + path + ": " +
                      (reason != nullptr ? reason : "unknown reason"));
  }
  void* symbol = dlsym(handle.get(), kEntryName);
  if (symbol == nullptr) {
    throw PluginError("Cannot load plug-in " + path + ": it has no entry " + kEntryName);
  }
  // Kept before the entry runs: whatever it registered, even when it then
  // throws, may hold code of this library.
  handles_.push_back(std::move(handle));
  Register(reinterpret_cast<RegisterEntry>(symbol), path, root);
  versions_.push_back(
      {std::filesystem::path(path).filename().string(), LoadedVersion(handles_.back().get())});
}

const std::vector<PluginVersion>& PluginLoader::Versions() const { return versions_; }

namespace {

const char kNoteName[] = "Hyracli";
constexpr ElfW(Word) kVersionNote = 1;

std::size_t Aligned(std::size_t size) { return (size + 3) / 4 * 4; }

// The version text in a block of notes, or empty. Sizes are checked against
// the block, so a malformed note ends the search instead of reading past it.
std::string FindVersion(const char* notes, std::size_t size) {
  std::size_t at = 0;
  while (size - at >= sizeof(ElfW(Nhdr))) {
    ElfW(Nhdr) header;
    std::memcpy(&header, notes + at, sizeof header);
    at += sizeof header;
    const std::size_t name = Aligned(header.n_namesz), desc = Aligned(header.n_descsz);
    if (name > size - at || desc > size - at - name) return std::string();
    if (header.n_type == kVersionNote && header.n_namesz == sizeof(kNoteName) &&
        std::memcmp(notes + at, kNoteName, sizeof(kNoteName)) == 0) {
      const char* text = notes + at + name;
      return std::string(text, strnlen(text, header.n_descsz));
    }
    at += name + desc;
  }
  return std::string();
}

struct Search {
  ElfW(Addr) base;
  std::string version;
};

int VisitObject(struct dl_phdr_info* info, std::size_t, void* data) {
  Search& search = *static_cast<Search*>(data);
  if (info->dlpi_addr != search.base) return 0;
  for (ElfW(Half) i = 0; i < info->dlpi_phnum; ++i) {
    const ElfW(Phdr)& segment = info->dlpi_phdr[i];
    if (segment.p_type != PT_NOTE) continue;
    search.version = FindVersion(reinterpret_cast<const char*>(info->dlpi_addr + segment.p_vaddr),
                                 segment.p_memsz);
    if (!search.version.empty()) return 1;
  }
  return 1;
}

}  // namespace

std::string LoadedVersion(void* handle) {
  struct link_map* map = nullptr;
  if (dlinfo(handle, RTLD_DI_LINKMAP, &map) != 0 || map == nullptr) return std::string();
  Search search{map->l_addr, std::string()};
  dl_iterate_phdr(&VisitObject, &search);
  return search.version;
}

const char* PluginSubdirectory() { return HYRACLI_PLUGIN_SUBDIR; }

std::string PluginDirectory(const std::string& given) {
  if (!given.empty()) return given;
  const char* environment = std::getenv("HYRACLI_PLUGIN_DIR");
  if (environment != nullptr && *environment != '\0') return environment;
  std::error_code error;
  std::filesystem::path self = std::filesystem::read_symlink("/proc/self/exe", error);
  if (error) throw PluginError("Cannot find the directory of hyracli: " + error.message());
  // Relative to the tool, so a tree installed under any prefix, or moved, still works.
  return (self.parent_path() / PluginSubdirectory()).lexically_normal().string();
}

}  // namespace Hyracli

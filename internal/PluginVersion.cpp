// The plug-in's version, as an ELF note that the host tool reads from the
// loaded library for "hyracli --version". A note needs no exported symbol, so
// the entry stays the library's only entry.
#include <cstddef>
#include <cstdint>

namespace HalvikCli {
namespace TarnNamespace {
namespace {

constexpr std::size_t Aligned(std::size_t size) { return (size + 3) / 4 * 4; }

struct VersionNote {
  uint32_t nameSize;
  uint32_t descSize;
  uint32_t type;
  char name[8];
  char desc[Aligned(sizeof(HYRA_VERSION))];
};

// A section named ".note..." becomes a note that the linker places in the
// library's loaded note segment.
__attribute__((section(".note.hyracli.version"), used, aligned(4)))
const VersionNote kVersionNote = {8, sizeof(HYRA_VERSION), 1, "Hyracli", HYRA_VERSION};

}  // namespace
}  // namespace TarnNamespace
}  // namespace HalvikCli

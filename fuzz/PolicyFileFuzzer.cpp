// Writes arbitrary contents to a policy file and reads its first line as
// configtarn add does; the line read must be exactly the contents up to the
// first line feed, or be refused when that is longer than the limit.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <string>

#include "OwnDirectory.h"
#include "support/PolicyFile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const OwnDirectory directory;
  static const std::string path = directory.File("policy");
  const std::string contents(reinterpret_cast<const char*>(data), size);
  std::ofstream(path, std::ios::binary | std::ios::trunc) << contents;

  const std::string expected = contents.substr(0, contents.find('\n'));
  std::string policy = "unchanged";
  const bool read = HalvikCli::TarnNamespace::ReadPolicyLine(path, policy);
  if (expected.size() > HalvikCli::TarnNamespace::kMaxPolicyLine) {
    if (read || policy != "unchanged") std::abort();
  } else if (!read || policy != expected) {
    std::abort();
  }
  return 0;
}

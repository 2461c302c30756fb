// The policy file of `configtarn add`: only its first line is the policy.
#pragma once

#include <cstddef>
#include <string>

namespace HalvikCli {
namespace TarnNamespace {

// The longest first line taken from a policy file; a longer one is refused
// rather than sent in part or read without end.
inline constexpr size_t kMaxPolicyLine = 1024 * 1024;

// Puts the first line of the file at path (without its line feed) into
// policy; an empty file gives an empty policy. False when path is not a
// regular file (after following links), cannot be read, or its first line is
// longer than kMaxPolicyLine; policy is then left as it was. Never blocks on a
// pipe or a device: those are refused before anything is read from them.
bool ReadPolicyLine(const std::string& path, std::string& policy);

}  // namespace TarnNamespace
}  // namespace HalvikCli

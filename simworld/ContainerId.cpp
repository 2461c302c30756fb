#include "ContainerId.h"

#include <cstring>

namespace HyraSim {
namespace {

constexpr size_t kHyphenatedLength = 36;
constexpr size_t kBareLength = 32;

bool IsHyphenPosition(size_t i) { return i == 8 || i == 13 || i == 18 || i == 23; }

int HexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

}  // namespace

bool NormalizeContainerId(const char* text, char* out) {
  if (text == nullptr || out == nullptr) return false;
  // Never look past the first character that would make the text too long.
  size_t length = 0;
  while (length <= kHyphenatedLength && text[length] != '\0') ++length;
  if (length != kHyphenatedLength && length != kBareLength) return false;

  const bool hyphenated = length == kHyphenatedLength;
  char digits[kBareLength];
  size_t count = 0;
  for (size_t i = 0; i < length; ++i) {
    if (hyphenated && IsHyphenPosition(i)) {
      if (text[i] != '-') return false;
      continue;
    }
    if (HexValue(text[i]) < 0) return false;
    digits[count++] = "0123456789abcdef"[HexValue(text[i])];
  }

  char normal[kContainerIdTextSize];
  size_t d = 0;
  for (size_t i = 0; i < kHyphenatedLength; ++i)
    normal[i] = IsHyphenPosition(i) ? '-' : digits[d++];
  normal[kHyphenatedLength] = '\0';
  std::memcpy(out, normal, kContainerIdTextSize);
  return true;
}

std::optional<std::string> NormalContainerId(const std::string& text) {
  // An embedded NUL would cut the text short; such a text is no id.
  if (text.find('\0') != std::string::npos) return std::nullopt;
  char normal[kContainerIdTextSize];
  if (!NormalizeContainerId(text.c_str(), normal)) return std::nullopt;
  return std::string(normal);
}

bool SameContainerId(const std::string& a, const std::string& b) {
  const auto normalA = NormalContainerId(a);
  const auto normalB = NormalContainerId(b);
  if (normalA && normalB) return *normalA == *normalB;
  return a == b;
}

std::string ContainerIdText(const std::string& id) { return NormalContainerId(id).value_or(id); }

}  // namespace HyraSim

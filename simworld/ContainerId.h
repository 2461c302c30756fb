// Container ids: a UUID in either case, with its four hyphens (8-4-4-4-12) or
// as 32 bare hexadecimal digits. The normal form is the lower-case hyphenated
// text of 36 characters.
#pragma once

#include <optional>
#include <string>

namespace HyraSim {

constexpr size_t kContainerIdTextSize = 37;  // 36 characters and the NUL

// Writes the normal form and its NUL into out (kContainerIdTextSize bytes) and
// answers true when text is a valid id; out is left untouched otherwise. Reads
// text no further than one character past the longest valid form.
bool NormalizeContainerId(const char* text, char* out);
std::optional<std::string> NormalContainerId(const std::string& text);

// Two ids name the same container when both are valid and share their normal
// form, or when they are the same text.
bool SameContainerId(const std::string& a, const std::string& b);

// The normal form of a valid id; any other text unchanged.
std::string ContainerIdText(const std::string& id);

}  // namespace HyraSim

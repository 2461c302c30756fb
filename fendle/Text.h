// Byte-level text helpers shared by the formatters and the tool: reading UTF-8
// one character at a time, making texts safe for a terminal, cutting long
// echoes, and finding the registered names closest to a mistyped one.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace Fendle {
namespace Text {

// One character of a UTF-8 text, or one stretch of bytes that is not UTF-8.
struct Utf8Unit {
  std::size_t length;  // bytes taken, at least 1
  bool valid;          // false: the bytes stand for one U+FFFD
  uint32_t codePoint;  // meaningful only when valid
};

// The unit that starts at byte at (< text.size()). Overlong forms, surrogates
// and values above U+10FFFF are not valid; a broken sequence ends before the
// byte that broke it, so that byte is read again as the start of the next unit.
Utf8Unit NextUtf8Unit(const std::string& text, std::size_t at);

// The text with every stretch that is not UTF-8 replaced by U+FFFD.
std::string ReplaceInvalidUtf8(const std::string& text);

// The text as a terminal may show it: control characters (C0 except line feed
// and, with keepTab, tab; DEL; C1) and bytes that are not UTF-8 become \xHH.
std::string TerminalSafe(const std::string& text, bool keepTab = true);

// The text cut to at most limit bytes at a character boundary, followed by a
// note of its full size when it was longer.
std::string Cut(const std::string& text, std::size_t limit);

// The longest error text written whole; longer ones are cut.
constexpr std::size_t kMessageLimit = 4096;
// The longest value quoted whole in the framework's own usage texts.
constexpr std::size_t kEchoLimit = 256;

// A value quoted in a usage text: cut, made safe for a terminal, in quotes.
std::string Echo(const std::string& value);

// The names closest to word by edit distance (adjacent swaps count as one
// edit, case is ignored), in the order given; empty when none is close enough
// to be a likely typo.
std::vector<std::string> ClosestNames(const std::string& word,
                                      const std::vector<std::string>& names);

// "\nDid you mean 'a'?" or "\nDid you mean one of 'a', 'b'?"; empty for no names.
std::string SuggestionText(const std::vector<std::string>& names);

// The names joined as "a, b or c".
std::string JoinChoices(const std::vector<std::string>& names);

}  // namespace Text
}  // namespace Fendle

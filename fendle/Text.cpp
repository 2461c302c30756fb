#include "fendle/Text.h"

#include <algorithm>
#include <cctype>

namespace Fendle {
namespace Text {

namespace {

bool InRange(unsigned char byte, unsigned char low, unsigned char high) {
  return byte >= low && byte <= high;
}

std::string Lower(const std::string& text) {
  std::string lower = text;
  for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return lower;
}

// Edit distance with adjacent transpositions (optimal string alignment).
std::size_t Distance(const std::string& a, const std::string& b) {
  const std::size_t n = a.size(), m = b.size();
  std::vector<std::vector<std::size_t> > d(n + 1, std::vector<std::size_t>(m + 1));
  for (std::size_t i = 0; i <= n; ++i) d[i][0] = i;
  for (std::size_t j = 0; j <= m; ++j) d[0][j] = j;
  for (std::size_t i = 1; i <= n; ++i) {
    for (std::size_t j = 1; j <= m; ++j) {
      const std::size_t cost = a[i - 1] == b[j - 1] ? 0 : 1;
      d[i][j] = std::min({d[i - 1][j] + 1, d[i][j - 1] + 1, d[i - 1][j - 1] + cost});
      if (i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1]) {
        d[i][j] = std::min(d[i][j], d[i - 2][j - 2] + 1);
      }
    }
  }
  return d[n][m];
}

const char kHex[] = "0123456789ABCDEF";

void AppendHex(std::string& out, unsigned char byte) {
  out += "\\x";
  out += kHex[byte >> 4];
  out += kHex[byte & 0x0F];
}

}  // namespace

Utf8Unit NextUtf8Unit(const std::string& text, std::size_t at) {
  const unsigned char lead = static_cast<unsigned char>(text[at]);
  if (lead < 0x80) return {1, true, lead};
  std::size_t needed = 0;
  unsigned char low = 0x80, high = 0xBF;  // range of the second byte
  uint32_t value = 0;
  if (InRange(lead, 0xC2, 0xDF)) {
    needed = 1;
    value = lead & 0x1F;
  } else if (InRange(lead, 0xE0, 0xEF)) {
    needed = 2;
    value = lead & 0x0F;
    if (lead == 0xE0) low = 0xA0;
    if (lead == 0xED) high = 0x9F;  // no surrogates
  } else if (InRange(lead, 0xF0, 0xF4)) {
    needed = 3;
    value = lead & 0x07;
    if (lead == 0xF0) low = 0x90;
    if (lead == 0xF4) high = 0x8F;  // nothing above U+10FFFF
  } else {
    return {1, false, 0};
  }
  std::size_t length = 1;
  for (; length <= needed; ++length) {
    if (at + length >= text.size()) return {length, false, 0};
    const unsigned char next = static_cast<unsigned char>(text[at + length]);
    if (length == 1 ? !InRange(next, low, high) : !InRange(next, 0x80, 0xBF)) {
      return {length, false, 0};
    }
    value = (value << 6) | (next & 0x3F);
  }
  return {length, true, value};
}

std::string ReplaceInvalidUtf8(const std::string& text) {
  std::string out;
  out.reserve(text.size());
  for (std::size_t at = 0; at < text.size();) {
    const Utf8Unit unit = NextUtf8Unit(text, at);
    if (unit.valid) {
      out.append(text, at, unit.length);
    } else {
      out += "\xEF\xBF\xBD";
    }
    at += unit.length;
  }
  return out;
}

std::string TerminalSafe(const std::string& text, bool keepTab) {
  std::string out;
  out.reserve(text.size());
  for (std::size_t at = 0; at < text.size();) {
    const Utf8Unit unit = NextUtf8Unit(text, at);
    const uint32_t c = unit.codePoint;
    const bool control = !unit.valid || (c < 0x20 && c != '\n' && !(keepTab && c == '\t')) ||
                         c == 0x7F || (c >= 0x80 && c <= 0x9F);
    if (control) {
      for (std::size_t i = 0; i < unit.length; ++i) {
        AppendHex(out, static_cast<unsigned char>(text[at + i]));
      }
    } else {
      out.append(text, at, unit.length);
    }
    at += unit.length;
  }
  return out;
}

std::string Cut(const std::string& text, std::size_t limit) {
  if (text.size() <= limit) return text;
  std::size_t end = 0;
  while (end < text.size()) {
    const std::size_t length = NextUtf8Unit(text, end).length;
    if (end + length > limit) break;
    end += length;
  }
  return text.substr(0, end) + "... (cut, " + std::to_string(text.size()) + " bytes in all)";
}

std::string Echo(const std::string& value) {
  return "'" + TerminalSafe(Cut(value, kEchoLimit)) + "'";
}

std::vector<std::string> ClosestNames(const std::string& word,
                                      const std::vector<std::string>& names) {
  const std::string typed = Lower(word);
  // A third of the word may be wrong, at least one letter: close enough for a
  // typo, too little for an unrelated word to match.
  const std::size_t allowed = std::max<std::size_t>(1, typed.size() / 3);
  std::size_t best = allowed + 1;
  std::vector<std::string> closest;
  for (const std::string& name : names) {
    const std::string candidate = Lower(name);
    // Comparing long texts costs their product; nothing that long is a name.
    if (candidate.size() > typed.size() + allowed || typed.size() > candidate.size() + allowed) {
      continue;
    }
    const std::size_t distance = Distance(typed, candidate);
    if (distance > allowed) continue;
    if (distance < best) {
      best = distance;
      closest.clear();
    }
    if (distance == best && std::find(closest.begin(), closest.end(), name) == closest.end()) {
      closest.push_back(name);
    }
  }
  return closest;
}

std::string SuggestionText(const std::vector<std::string>& names) {
  if (names.empty()) return std::string();
  std::string text = names.size() == 1 ? "\nDid you mean " : "\nDid you mean one of ";
  for (std::size_t i = 0; i < names.size(); ++i) {
    text += (i == 0 ? "'" : ", '") + TerminalSafe(names[i]) + "'";
  }
  return text + "?";
}

std::string JoinChoices(const std::vector<std::string>& names) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0) text += i + 1 == names.size() ? " or " : ", ";
    text += names[i];
  }
  return text;
}

}  // namespace Text
}  // namespace Fendle

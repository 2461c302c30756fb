#include "fendle/ArgumentParser.h"

#include <boost/algorithm/string/predicate.hpp>
#include <charconv>
#include <cstdint>
#include <set>

#include "fendle/Text.h"

namespace Fendle {
namespace CommandLine {

using CallSpec::ParameterSpec;
using CallSpec::ParameterType;

UsageError::UsageError(const std::string& message) : std::runtime_error(message) {}

UsageError::~UsageError() = default;

namespace {

using Text::Echo;

std::string OptionName(const ParameterSpec& parameter) { return "--" + parameter.GetName(); }

const char kTerminator[] = "--";

// "Unknown option" with the closest long names, for a long option only: one
// letter is too little to guess from.
[[noreturn]] void RefuseUnknown(const std::string& word, const CallSpec::InputSpec& spec) {
  std::string text = "Unknown option " + Echo(word);
  if (word.compare(0, 2, "--") == 0) {
    std::vector<std::string> names;
    for (const auto& parameter : spec.GetParameters()) names.push_back(parameter->GetName());
    std::vector<std::string> closest = Text::ClosestNames(word.substr(2), names);
    for (std::string& name : closest) name = "--" + name;
    text += Text::SuggestionText(closest);
  }
  throw UsageError(text);
}

bool IsList(ParameterType type) {
  return type == ParameterType::StringList || type == ParameterType::IntList ||
         type == ParameterType::BoolList;
}

// A signed decimal with nothing around it: no blanks, no base prefix, no junk.
int64_t ParseInt(const ParameterSpec& parameter, const std::string& text) {
  const char* begin = text.data();
  const char* end = begin + text.size();
  // from_chars takes a minus but not a plus sign.
  if (begin != end && *begin == '+' && end - begin > 1 && begin[1] != '-') ++begin;
  int64_t value = 0;
  std::from_chars_result parsed = std::from_chars(begin, end, value, 10);
  if (parsed.ec == std::errc::result_out_of_range) {
    throw UsageError("Value " + Echo(text) + " of option " + OptionName(parameter) +
                     " is out of range for a 64-bit integer");
  }
  if (parsed.ec != std::errc() || parsed.ptr != end) {
    throw UsageError("Value " + Echo(text) + " of option " + OptionName(parameter) +
                     " is not an integer");
  }
  return value;
}

bool ParseBool(const ParameterSpec& parameter, const std::string& text) {
  for (const char* word : {"true", "1", "yes"}) {
    if (boost::algorithm::iequals(text, word)) return true;
  }
  for (const char* word : {"false", "0", "no"}) {
    if (boost::algorithm::iequals(text, word)) return false;
  }
  throw UsageError("Value " + Echo(text) + " of option " + OptionName(parameter) +
                   " must be true or false");
}

}  // namespace

ArgumentParser::ArgumentParser(const boost::shared_ptr<CallSpec::InputSpec>& spec)
    : spec_(spec ? spec : CallSpec::InputSpec::New()) {}

boost::shared_ptr<CallSpec::Input> ArgumentParser::Parse(
    const std::vector<std::string>& words) const {
  boost::shared_ptr<CallSpec::Input> input = CallSpec::Input::New();
  std::set<std::string> given;
  for (std::size_t at = 0; at < words.size(); ++at) {
    const std::string& word = words[at];
    if (word == kTerminator) {
      if (at + 1 < words.size()) throw UsageError("Unexpected argument " + Echo(words[at + 1]));
      break;
    }
    boost::shared_ptr<ParameterSpec> parameter;
    bool inline_value = false;
    std::string value;
    if (word.size() > 2 && word.compare(0, 2, "--") == 0) {
      std::string::size_type equals = word.find('=');
      std::string name = word.substr(2, equals == std::string::npos ? equals : equals - 2);
      if (equals != std::string::npos) {
        inline_value = true;
        value = word.substr(equals + 1);
      }
      parameter = spec_->FindParameter(name);
      if (!parameter) RefuseUnknown("--" + name, *spec_);
    } else if (word.size() > 1 && word[0] == '-' && word[1] != '-') {
      parameter = spec_->FindAlias(word.substr(1));
      if (!parameter) RefuseUnknown(word, *spec_);
    } else {
      throw UsageError("Unexpected argument " + Echo(word));
    }

    const ParameterType type = parameter->GetType();
    if (!IsList(type) && !given.insert(parameter->GetName()).second) {
      throw UsageError("Option " + OptionName(*parameter) + " is given more than once");
    }
    if (type == ParameterType::Flag) {
      if (inline_value) throw UsageError("Option " + OptionName(*parameter) + " takes no value");
      input->SetFlag(parameter->GetName());
      continue;
    }
    if (!inline_value) {
      // The next word is the value even when it starts with a dash ("-t -5").
      if (at + 1 >= words.size()) {
        throw UsageError("Option " + OptionName(*parameter) + " needs a value");
      }
      value = words[++at];
    }
    Store(*parameter, value, *input);
  }

  std::string missing;
  for (const auto& parameter : spec_->GetParameters()) {
    if (parameter->IsRequired() && !input->IsSet(parameter->GetName())) {
      missing += (missing.empty() ? "" : ", ") + OptionName(*parameter);
    }
  }
  if (!missing.empty()) throw UsageError("Missing required option: " + missing);
  return input;
}

boost::shared_ptr<ParameterSpec> ArgumentParser::Named(const std::string& word) const {
  if (word.size() > 2 && word.compare(0, 2, "--") == 0) {
    if (word.find('=') != std::string::npos) return nullptr;
    return spec_->FindParameter(word.substr(2));
  }
  if (word.size() > 1 && word[0] == '-' && word[1] != '-') return spec_->FindAlias(word.substr(1));
  return nullptr;
}

template <typename Visit>
std::size_t ArgumentParser::ForEachOptionWord(const std::vector<std::string>& words,
                                              Visit visit) const {
  for (std::size_t at = 0; at < words.size(); ++at) {
    if (words[at] == kTerminator) return at;
    // The visitor answers how many words it used beyond this one.
    const std::size_t used = visit(at);
    if (used > 0) {
      at += used;
      continue;
    }
    boost::shared_ptr<ParameterSpec> parameter = Named(words[at]);
    if (parameter && parameter->GetType() != ParameterType::Flag) ++at;  // skip its value
  }
  return words.size();
}

bool ArgumentParser::AsksForHelp(const std::vector<std::string>& words) const {
  const bool shortHelp = !spec_->FindAlias("h");
  bool asks = false;
  ForEachOptionWord(words, [&](std::size_t at) {
    asks = asks || words[at] == "--help" || (shortHelp && words[at] == "-h");
    return std::size_t{0};
  });
  return asks;
}

std::vector<std::string> ArgumentParser::TakeToolOption(std::vector<std::string>& words,
                                                        const std::string& name,
                                                        const std::string& alias) const {
  std::vector<std::string> values;
  if (spec_->FindParameter(name)) return values;
  const std::string option = "--" + name;
  const std::string shortOption = alias.empty() || spec_->FindAlias(alias) ? "" : "-" + alias;
  std::vector<std::size_t> taken;  // indexes of the option's words and values
  ForEachOptionWord(words, [&](std::size_t at) {
    const std::string& word = words[at];
    if (word.compare(0, option.size() + 1, option + "=") == 0) {
      values.push_back(word.substr(option.size() + 1));
      taken.push_back(at);
      return std::size_t{0};
    }
    if (word == option || (!shortOption.empty() && word == shortOption)) {
      if (at + 1 >= words.size() || words[at + 1] == kTerminator) {
        throw UsageError("Option " + option + " needs a value");
      }
      values.push_back(words[at + 1]);
      taken.push_back(at);
      taken.push_back(at + 1);
      return std::size_t{1};
    }
    return std::size_t{0};
  });
  for (auto index = taken.rbegin(); index != taken.rend(); ++index) {
    words.erase(words.begin() + static_cast<std::ptrdiff_t>(*index));
  }
  return values;
}

void ArgumentParser::Store(const ParameterSpec& parameter, const std::string& value,
                           CallSpec::Input& input) const {
  const std::string& name = parameter.GetName();
  switch (parameter.GetType()) {
    case ParameterType::String:
      input.SetString(name, value);
      break;
    case ParameterType::StringList:
      input.AddString(name, value);
      break;
    case ParameterType::Int:
      input.SetInt(name, ParseInt(parameter, value));
      break;
    case ParameterType::IntList:
      input.AddInt(name, ParseInt(parameter, value));
      break;
    case ParameterType::Bool:
      input.SetBool(name, ParseBool(parameter, value));
      break;
    case ParameterType::BoolList:
      input.AddBool(name, ParseBool(parameter, value));
      break;
    case ParameterType::Flag:
      input.SetFlag(name);
      break;
  }
}

}  // namespace CommandLine
}  // namespace Fendle

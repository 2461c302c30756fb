#include "hyracli/Completion.h"

#include <algorithm>
#include <sstream>

#include "fendle/Formatter.h"
#include "hyracli/HyraCli.h"
#include "hyracli/ToolOptionList.h"
#include "hyracli/TreeWalk.h"

namespace Hyracli {

namespace {

using Fendle::CallSpec::ParameterType;

// What an option takes after it on the command line.
enum class Value { None, Text, Bool, Formatter, Directory };

struct Option {
  std::string name;   // long name, without dashes
  std::string alias;  // one letter, or empty
  Value value;
  std::string help;  // one line
};

enum class Kind { Namespace, Command, Shells };

struct Child {
  std::string name;
  std::string description;  // one line
};

// One place a user can stand on the command line: a namespace, a command, or
// the completion word itself (which takes a shell name).
struct Stop {
  std::string path;  // the words from the root, joined by blanks; empty for the root
  Kind kind;
  std::vector<Child> children;  // namespaces and commands, or shell names
  std::vector<Option> options;
};

// Texts that span lines are shown on one.
std::string OneLine(const std::string& text) {
  std::string line;
  for (char c : text) line += (c == '\n' || c == '\t') ? ' ' : c;
  while (!line.empty() && line.back() == ' ') line.pop_back();
  return line;
}

// The menu line of a parameter: its type, whether it is required, and its help.
std::string OptionLine(const Fendle::CallSpec::ParameterSpec& parameter) {
  const std::string line = Fendle::CallSpec::ParameterTypeName(parameter.GetType()) +
                           (parameter.IsRequired() ? ", required" : "");
  const std::string help = OneLine(parameter.GetHelp());
  return help.empty() ? line : line + ": " + help;
}

Value ValueOf(ParameterType type) {
  switch (type) {
    case ParameterType::Flag:
      return Value::None;
    case ParameterType::Bool:
    case ParameterType::BoolList:
      return Value::Bool;
    default:
      return Value::Text;
  }
}

Value ValueOf(ToolOptionValue value) {
  switch (value) {
    case ToolOptionValue::Formatter:
      return Value::Formatter;
    case ToolOptionValue::Directory:
      return Value::Directory;
    default:
      return Value::None;
  }
}

Option ToolOptionOf(const ToolOption& option) {
  return {option.name, option.alias, ValueOf(option.value), option.help};
}

// The global options that ask for help, which every namespace and command takes too.
std::vector<Option> HelpOptions() {
  std::vector<Option> options;
  for (const ToolOption& option : ToolOptionList()) {
    if (option.name == "help") options.push_back(ToolOptionOf(option));
  }
  return options;
}

std::vector<Stop> StopsOf(const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root) {
  std::vector<Stop> stops;
  VisitTree(root, [&stops](const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& node) {
    Stop stop{node->GetParent() ? node->GetPathString(' ') : std::string(), Kind::Namespace,
              {}, {}};
    if (boost::shared_ptr<Fendle::AutoCli::Command> command = AsCommand(node)) {
      stop.kind = Kind::Command;
      // Held here: the parameters belong to the input declaration, which may be made per call.
      const boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = command->GetInputSpec();
      for (const auto& parameter : spec->GetParameters()) {
        stop.options.push_back(
            {parameter->GetName(), parameter->GetAlias(), ValueOf(parameter->GetType()),
             OptionLine(*parameter)});
      }
    } else if (node->GetType() == Fendle::AutoCli::NodeType::Command) {
      return;  // not runnable, so nothing to complete
    }
    for (const auto& child : node->GetNamespaceNodes()) {
      stop.children.push_back({child->GetName(), OneLine(child->GetDescription())});
    }
    const std::vector<Option> help = HelpOptions();
    stop.options.insert(stop.options.end(), help.begin(), help.end());
    stops.push_back(stop);
  });
  // The root takes the global options and the tool's own completion word.
  Stop& top = stops.front();
  top.options.clear();
  for (const ToolOption& option : ToolOptionList()) top.options.push_back(ToolOptionOf(option));
  if (!root->HasNamespaceNode(kCompletionWord)) {
    top.children.push_back({kCompletionWord, "Print a shell completion script."});
    Stop shells{kCompletionWord, Kind::Shells, {}, {}};
    for (const std::string& shell : CompletionShells()) shells.children.push_back({shell, ""});
    stops.push_back(shells);
  }
  return stops;
}

// Single-quoted for bash and zsh.
std::string ShQuote(const std::string& text) {
  std::string quoted = "'";
  for (char c : text) quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
  return quoted + "'";
}

// Single-quoted for fish, where a backslash escapes a quote or a backslash.
std::string FishQuote(const std::string& text) {
  std::string quoted = "'";
  for (char c : text) {
    if (c == '\'' || c == '\\') quoted += '\\';
    quoted += c;
  }
  return quoted + "'";
}

std::vector<std::string> WordsOf(const Option& option) {
  std::vector<std::string> words{"--" + option.name};
  if (!option.alias.empty()) words.push_back("-" + option.alias);
  return words;
}

// "a b c" as a quoted list: 'a' 'b' 'c'.
std::string ShList(const std::vector<std::string>& words) {
  std::string list;
  for (const std::string& word : words) list += (list.empty() ? "" : " ") + ShQuote(word);
  return list;
}

std::vector<std::string> NamesOf(const std::vector<Child>& children) {
  std::vector<std::string> names;
  for (const Child& child : children) names.push_back(child.name);
  return names;
}

std::vector<std::string> OptionWords(const std::vector<Option>& options) {
  std::vector<std::string> words;
  for (const Option& option : options) {
    for (const std::string& word : WordsOf(option)) words.push_back(word);
  }
  return words;
}

const char* KindWord(Kind kind) {
  switch (kind) {
    case Kind::Command:
      return "cmd";
    case Kind::Shells:
      return "shell";
    default:
      return "ns";
  }
}

// The functions bash and zsh share: what each place on the command line
// offers, which options take a value, and the walk over the words typed so far.
void WriteShCommon(const std::vector<Stop>& stops, std::ostream& out) {
  out << "# The place named by the words in $1: sets __hyracli_kind (ns, cmd or shell),\n"
         "# __hyracli_reply (the words that may follow) and __hyracli_options.\n"
         "__hyracli_node() {\n"
         "  case \"$1\" in\n";
  for (const Stop& stop : stops) {
    out << "    " << ShQuote(stop.path) << ") __hyracli_kind=" << KindWord(stop.kind)
        << "; __hyracli_reply=(" << ShList(NamesOf(stop.children)) << "); __hyracli_options=("
        << ShList(OptionWords(stop.options)) << ");;\n";
  }
  out << "    *) return 1;;\n"
         "  esac\n"
         "}\n\n";

  out << "# Succeeds when option $2 at the place $1 takes a value, and sets\n"
         "# __hyracli_reply to the values to offer (__hyracli_dirs: a directory).\n"
         "__hyracli_value() {\n"
         "  __hyracli_dirs=\n"
         "  case \"$1|$2\" in\n";
  for (const Stop& stop : stops) {
    for (const Option& option : stop.options) {
      if (option.value == Value::None) continue;
      std::string keys;
      for (const std::string& word : WordsOf(option)) {
        keys += (keys.empty() ? "" : "|") + ShQuote(stop.path + "|" + word);
      }
      std::vector<std::string> values;
      std::string extra;
      if (option.value == Value::Bool) values = {"true", "false"};
      if (option.value == Value::Formatter) values = Fendle::Format::FormatterNames();
      if (option.value == Value::Directory) extra = " __hyracli_dirs=1;";
      out << "    " << keys << ")" << extra << " __hyracli_reply=(" << ShList(values) << ");;\n";
    }
  }
  out << "    *) return 1;;\n"
         "  esac\n"
         "}\n\n";

  out << "# Walks the words before the one being completed. Sets __hyracli_path to\n"
         "# the place reached and __hyracli_expect to the option whose value is being\n"
         "# completed; fails where nothing can follow.\n"
         "__hyracli_walk() {\n"
         "  __hyracli_path= __hyracli_kind=ns __hyracli_expect=\n"
         "  local word\n"
         "  while (($#)); do\n"
         "    word=$1\n"
         "    shift\n"
         "    if [[ $word == -* ]]; then\n"
         "      [[ $word == *=* ]] && continue\n"
         "      if __hyracli_value \"$__hyracli_path\" \"$word\" || __hyracli_value '' \"$word\"; "
         "then\n"
         "        if (($# == 0)); then\n"
         "          __hyracli_expect=$word\n"
         "          return 0\n"
         "        fi\n"
         "        shift\n"
         "      fi\n"
         "      continue\n"
         "    fi\n"
         "    [[ $__hyracli_kind == ns ]] || return 1\n"
         "    __hyracli_node \"${__hyracli_path:+$__hyracli_path }$word\" || return 1\n"
         "    __hyracli_path=${__hyracli_path:+$__hyracli_path }$word\n"
         "  done\n"
         "  return 0\n"
         "}\n\n";
}

void WriteBash(const std::vector<Stop>& stops, std::ostream& out) {
  out << "# bash completion for hyracli                              -*- shell-script -*-\n"
         "# Generated by 'hyracli completion bash' from the commands of the loaded plug-ins.\n\n";
  WriteShCommon(stops, out);
  out << "_hyracli() {\n"
         "  local cur words cword\n"
         "  if declare -F _get_comp_words_by_ref >/dev/null; then\n"
         "    # Keeps --name=value and values with colons in one word.\n"
         "    _get_comp_words_by_ref -n =: cur words cword\n"
         "  else\n"
         "    words=(\"${COMP_WORDS[@]}\") cword=$COMP_CWORD cur=${COMP_WORDS[COMP_CWORD]}\n"
         "  fi\n"
         "  local __hyracli_path __hyracli_kind __hyracli_expect __hyracli_dirs\n"
         "  local -a __hyracli_reply __hyracli_options\n"
         "  COMPREPLY=()\n"
         "  __hyracli_walk \"${words[@]:1:cword-1}\" || return 0\n"
         "  local option=$__hyracli_expect prefix=\n"
         "  if [[ -z $option && $cur == -*=* ]]; then\n"
         "    option=${cur%%=*} prefix=${cur%%=*}= cur=${cur#*=}\n"
         "  fi\n"
         "  if [[ -n $option ]]; then\n"
         "    __hyracli_value \"$__hyracli_path\" \"$option\" || __hyracli_value '' \"$option\" || "
         "return 0\n"
         "    if [[ -n $__hyracli_dirs ]]; then\n"
         "      compopt -o filenames 2>/dev/null\n"
         "      mapfile -t COMPREPLY < <(compgen -P \"$prefix\" -d -- \"$cur\")\n"
         "    else\n"
         "      mapfile -t COMPREPLY < <(compgen -P \"$prefix\" -W \"${__hyracli_reply[*]}\" -- "
         "\"$cur\")\n"
         "    fi\n"
         "    return 0\n"
         "  fi\n"
         "  __hyracli_node \"$__hyracli_path\" || return 0\n"
         "  if [[ $cur == -* ]]; then\n"
         "    mapfile -t COMPREPLY < <(compgen -W \"${__hyracli_options[*]}\" -- \"$cur\")\n"
         "  elif [[ $__hyracli_kind != cmd ]]; then\n"
         "    mapfile -t COMPREPLY < <(compgen -W \"${__hyracli_reply[*]}\" -- \"$cur\")\n"
         "  fi\n"
         "  return 0\n"
         "}\n"
         "complete -F _hyracli hyracli\n";
}

// Descriptions for zsh's menus, as "name:description" with colons in the name escaped.
std::string Described(const std::string& name, const std::string& description) {
  std::string escaped;
  for (char c : name) escaped += c == ':' ? std::string("\\:") : std::string(1, c);
  return description.empty() ? escaped : escaped + ":" + description;
}

void WriteZsh(const std::vector<Stop>& stops, std::ostream& out) {
  out << "#compdef hyracli\n"
         "# zsh completion for hyracli, generated by 'hyracli completion zsh' from the\n"
         "# commands of the loaded plug-ins.\n\n";
  WriteShCommon(stops, out);
  out << "# The described words of the place $1: sets __hyracli_words and __hyracli_flags.\n"
         "__hyracli_described() {\n"
         "  case \"$1\" in\n";
  for (const Stop& stop : stops) {
    std::vector<std::string> words, flags;
    for (const Child& child : stop.children) words.push_back(Described(child.name, child.description));
    for (const Option& option : stop.options) {
      for (const std::string& word : WordsOf(option)) flags.push_back(Described(word, option.help));
    }
    out << "    " << ShQuote(stop.path) << ") __hyracli_words=(" << ShList(words)
        << "); __hyracli_flags=(" << ShList(flags) << ");;\n";
  }
  out << "  esac\n"
         "}\n\n"
         "_hyracli() {\n"
         "  local __hyracli_path __hyracli_kind __hyracli_expect __hyracli_dirs\n"
         "  local -a __hyracli_reply __hyracli_options __hyracli_words __hyracli_flags\n"
         "  local cur=${words[CURRENT]} option=\n"
         "  __hyracli_walk \"${(@)words[2,CURRENT-1]}\" || return 1\n"
         "  option=$__hyracli_expect\n"
         "  if [[ -z $option && $cur == -*=* ]]; then\n"
         "    option=${cur%%=*}\n"
         "    compset -P '*='\n"
         "  fi\n"
         "  if [[ -n $option ]]; then\n"
         "    __hyracli_value \"$__hyracli_path\" \"$option\" || __hyracli_value '' \"$option\" || "
         "return 1\n"
         "    if [[ -n $__hyracli_dirs ]]; then\n"
         "      _directories\n"
         "    else\n"
         "      compadd -a __hyracli_reply\n"
         "    fi\n"
         "    return\n"
         "  fi\n"
         "  __hyracli_node \"$__hyracli_path\" || return 1\n"
         "  __hyracli_described \"$__hyracli_path\"\n"
         "  if [[ $cur == -* ]]; then\n"
         "    _describe -t options option __hyracli_flags\n"
         "  elif [[ $__hyracli_kind != cmd ]]; then\n"
         "    _describe -t commands command __hyracli_words\n"
         "  fi\n"
         "}\n\n"
         "# Autoloaded from fpath the file's body is the completion function itself;\n"
         "# sourced, it registers the function.\n"
         "if [[ ${zsh_eval_context[-1]} == loadautofunc ]]; then\n"
         "  _hyracli \"$@\"\n"
         "else\n"
         "  compdef _hyracli hyracli\n"
         "fi\n";
}

void WriteFish(const std::vector<Stop>& stops, std::ostream& out) {
  out << "# fish completion for hyracli, generated by 'hyracli completion fish' from the\n"
         "# commands of the loaded plug-ins.\n\n"
         "# Succeeds when option $argv[2] at the place $argv[1] takes a value.\n"
         "function __hyracli_takes_value\n"
         "    switch \"$argv[1]|$argv[2]\"\n";
  std::string keys;
  for (const Stop& stop : stops) {
    for (const Option& option : stop.options) {
      if (option.value == Value::None) continue;
      for (const std::string& word : WordsOf(option)) {
        keys += " \\\n            " + FishQuote(stop.path + "|" + word);
      }
    }
  }
  if (!keys.empty()) {
    out << "        case" << keys << "\n"
        << "            return 0\n";
  }
  out << "    end\n"
         "    return 1\n"
         "end\n\n"
         "# Prints the place named by the words typed so far.\n"
         "function __hyracli_path\n"
         "    set -l path\n"
         "    set -l skip 0\n"
         "    for word in (commandline -opc)[2..-1]\n"
         "        if test $skip = 1\n"
         "            set skip 0\n"
         "            continue\n"
         "        end\n"
         "        switch $word\n"
         "            case '-*=*'\n"
         "                continue\n"
         "            case '-*'\n"
         "                if __hyracli_takes_value \"$path\" $word; or __hyracli_takes_value '' "
         "$word\n"
         "                    set skip 1\n"
         "                end\n"
         "                continue\n"
         "        end\n"
         "        set path $path $word\n"
         "    end\n"
         "    echo \"$path\"\n"
         "end\n\n"
         "function __hyracli_at\n"
         "    set -l path (__hyracli_path); or return 1\n"
         "    test \"$path\" = \"$argv[1]\"\n"
         "end\n\n"
         "complete -c hyracli -f\n";
  for (const Stop& stop : stops) {
    const std::string condition = " -n " + FishQuote("__hyracli_at " + FishQuote(stop.path));
    for (const Child& child : stop.children) {
      out << "complete -c hyracli" << condition << " -a " << FishQuote(child.name);
      if (!child.description.empty()) out << " -d " << FishQuote(child.description);
      out << "\n";
    }
    for (const Option& option : stop.options) {
      out << "complete -c hyracli" << condition << " -l " << FishQuote(option.name);
      if (!option.alias.empty()) out << " -s " << FishQuote(option.alias);
      switch (option.value) {
        case Value::None:
          break;
        case Value::Text:
          out << " -r";
          break;
        case Value::Bool:
          out << " -x -a 'true false'";
          break;
        case Value::Formatter: {
          std::string names;
          for (const std::string& name : Fendle::Format::FormatterNames()) {
            names += (names.empty() ? "" : " ") + name;
          }
          out << " -x -a " << FishQuote(names);
          break;
        }
        case Value::Directory:
          out << " -x -a '(__fish_complete_directories)'";
          break;
      }
      if (!option.help.empty()) out << " -d " << FishQuote(option.help);
      out << "\n";
    }
  }
}

}  // namespace

const std::vector<std::string>& CompletionShells() {
  static const std::vector<std::string> kShells = {"bash", "zsh", "fish"};
  return kShells;
}

bool WriteCompletionScript(const std::string& shell,
                           const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root,
                           std::ostream& out) {
  if (shell == "bash") {
    WriteBash(StopsOf(root), out);
  } else if (shell == "zsh") {
    WriteZsh(StopsOf(root), out);
  } else if (shell == "fish") {
    WriteFish(StopsOf(root), out);
  } else {
    return false;
  }
  return true;
}

int RunCompletion(const std::vector<std::string>& args,
                  const boost::shared_ptr<Fendle::AutoCli::NamespaceNode>& root, std::ostream& out,
                  std::ostream& err) {
  std::string shells;
  for (const std::string& shell : CompletionShells()) shells += (shells.empty() ? "" : "|") + shell;
  const std::string usage = std::string("Usage: hyracli ") + kCompletionWord + " " + shells + "\n";
  if (std::find(args.begin(), args.end(), "--help") != args.end()) {
    out << usage << "\nPrints the shell's completion script for the commands loaded now.\n";
    return kExitOk;
  }
  std::ostringstream script;
  if (args.size() != 1 || !WriteCompletionScript(args.front(), root, script)) {
    err << "hyracli: " << kCompletionWord << " takes one shell: " << shells << "\n" << usage;
    return kExitUsage;
  }
  out << script.str();
  return kExitOk;
}

}  // namespace Hyracli

#include "hyracli/HyraCli.h"

#include <algorithm>
#include <boost/pointer_cast.hpp>
#include <cerrno>
#include <cstring>
#include <exception>
#include <sstream>

#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"
#include "fendle/ArgumentParser.h"
#include "fendle/Formatter.h"
#include "hyracli/Completion.h"
#include "fendle/Text.h"
#include "hyracli/PluginLoader.h"
#include "hyracli/ToolOptionList.h"

namespace Hyracli {

using Fendle::AutoCli::Command;
using Fendle::AutoCli::Namespace;
using Fendle::AutoCli::NamespaceNode;
using Fendle::AutoCli::NodeType;
using Fendle::CommandLine::UsageError;

namespace {

const char kTool[] = "hyracli";

const char kFormatterOption[] = "formatter";
const char kHelpWord[] = "help";

// Writes text as one message: a line feed is added only where it lacks one.
// Texts may echo what a user typed or the host stored: control bytes are shown
// escaped, and a huge text is cut rather than flooding the terminal.
void WriteMessage(std::ostream& err, const std::string& text) {
  const std::string shown =
      Fendle::Text::TerminalSafe(Fendle::Text::Cut(text, Fendle::Text::kMessageLimit));
  err << shown;
  if (shown.empty() || shown.back() != '\n') err << '\n';
}

// The formatter name checked against the registry; throws UsageError.
std::string CheckFormatter(const std::string& name) {
  if (!Fendle::Format::CreateFormatter(name)) {
    throw UsageError("Unknown formatter " + Fendle::Text::Echo(name) + "; choose " +
                     Fendle::Text::JoinChoices(Fendle::Format::FormatterNames()) +
                     Fendle::Text::SuggestionText(
                         Fendle::Text::ClosestNames(name, Fendle::Format::FormatterNames())));
  }
  return name;
}

int ReportUsage(std::ostream& err, const std::string& message, const std::string& helpLine) {
  WriteMessage(err, std::string(kTool) + ": " + message);
  err << "Run '" << helpLine << " --help' for help.\n";
  return kExitUsage;
}

// Writes the error texts the command reported, in order.
void WriteErrors(const Fendle::CallSpec::Output& output, std::ostream& err) {
  for (const std::string& error : output.GetErrors()) WriteMessage(err, error);
}

// Reports the exception in flight that left a command; never rethrows.
int ReportCommandException(std::ostream& err) {
  std::string message;
  try {
    throw;
  } catch (const OskCtl::Lib::OskCtlException& e) {
    message = e.GetMessage();
  } catch (const HostCtl::Lib::HostCtlException& e) {
    message = e.GetMessage();
  } catch (const std::exception& e) {
    message = e.what();
  } catch (...) {
    message = "the command failed with an unknown exception";
  }
  WriteMessage(err, std::string(kTool) + ": " + message);
  return kExitCommandFailed;
}

// The words a user types to reach node, starting with the tool's name.
std::string CommandLineOf(const NamespaceNode& node) {
  std::string path = node.GetPathString(' ');
  return path.empty() ? std::string(kTool) : std::string(kTool) + " " + path;
}

// Children of one kind as "  name  description" lines, names aligned.
void ListChildren(const NamespaceNode& node, NodeType type, const std::string& title,
                  std::ostream& out) {
  std::vector<boost::shared_ptr<NamespaceNode> > children;
  std::size_t width = 0;
  for (const auto& child : node.GetNamespaceNodes()) {
    if (child->GetType() != type) continue;
    children.push_back(child);
    width = std::max(width, child->GetName().size());
  }
  if (children.empty()) return;
  out << "\n" << title << ":\n";
  for (const auto& child : children) {
    // Descriptions are written exactly as declared, blanks included.
    const std::string description = child->GetDescription();
    out << "  " << child->GetName();
    if (!description.empty()) {
      out << std::string(width - child->GetName().size() + 2, ' ') << description;
    }
    out << "\n";
  }
}

void ListNamespace(const NamespaceNode& node, std::ostream& out) {
  const bool root = !node.GetParent();
  if (root) {
    out << "Usage: " << kTool << " [global options] <namespace> ... <command> [options]\n";
  } else {
    out << "Usage: " << CommandLineOf(node) << " <namespace|command> ...\n";
  }
  if (!node.GetDescription().empty()) out << "\n" << node.GetDescription() << "\n";
  if (root) {
    out << "\nGlobal options (before the command words; --formatter also after them):\n"
           "  --formatter NAME, -o NAME  render the result as "
        << Fendle::Text::JoinChoices(Fendle::Format::FormatterNames())
        << " (any case)\n"
           "  --plugin-dir DIR           load the plug-ins from DIR\n"
           "  --help, -h, help           show help for the words that follow\n"
           "  --version                  show the versions of hyracli and its plug-ins\n"
           "  --                         end the global options\n"
           "\nShell completion:\n"
           "  completion bash|zsh|fish   print the shell's completion script\n";
  }
  ListChildren(node, NodeType::Namespace, "Namespaces", out);
  ListChildren(node, NodeType::Command, "Commands", out);
}

// Picks the formatter: the one asked for, else the command's default, else
// "simple" (which also writes a boolean as true or false).
std::unique_ptr<Fendle::Format::Formatter> ChooseFormatter(const std::string& asked,
                                                           const Command& command) {
  std::unique_ptr<Fendle::Format::Formatter> formatter =
      Fendle::Format::CreateFormatter(asked.empty() ? command.GetDefaultOutputFormatter() : asked);
  return formatter ? std::move(formatter) : Fendle::Format::CreateFormatter("simple");
}

int RunCommand(Command& command, const std::vector<std::string>& args,
               const std::string& formatterName, std::ostream& out, std::ostream& err) {
  boost::shared_ptr<Fendle::CallSpec::Output> output = Fendle::CallSpec::Output::New();
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> outputSpec;
  try {
    boost::shared_ptr<Fendle::CallSpec::Input> input;
    try {
      input = Fendle::CommandLine::ArgumentParser(command.GetInputSpec()).Parse(args);
    } catch (const UsageError& e) {
      return ReportUsage(err, e.what(), CommandLineOf(command));
    }
    outputSpec = command.GetOutputSpec();
    command.Execute(input, output);
  } catch (...) {
    // What the command reported before the exception left it is not lost.
    WriteErrors(*output, err);
    return ReportCommandException(err);
  }

  // An error wins over any result the command also set: nothing on standard output.
  if (output->HasError()) {
    WriteErrors(*output, err);
    return kExitCommandFailed;
  }
  if (!output->IsFinished()) {
    WriteMessage(err, std::string(kTool) + ": the command ended without finishing");
    return kExitCommandFailed;
  }
  if (!output->GetResult()) {
    WriteMessage(err, std::string(kTool) + ": the command finished without a result");
    return kExitCommandFailed;
  }
  // Written as it is rendered: a large result is never held twice. A failure
  // while rendering may leave part of it written, and is then reported.
  try {
    ChooseFormatter(formatterName, command)
        ->Render(output->GetResult(),
                 Fendle::Format::FormatHints(command.GetDefaultOutputFormatParameters(),
                                             outputSpec->GetResultType()),
                 out);
  } catch (...) {
    return ReportCommandException(err);
  }
  return kExitOk;
}

// Fills options; false after reporting a usage error.
bool ParseOrReport(const std::vector<std::string>& args, GlobalOptions& options,
                   std::ostream& err) {
  try {
    options = ParseGlobalOptions(args);
  } catch (const UsageError& e) {
    ReportUsage(err, e.what(), kTool);
    return false;
  }
  return true;
}

}  // namespace

GlobalOptions ParseGlobalOptions(const std::vector<std::string>& args) {
  GlobalOptions options;
  bool formatterGiven = false;
  bool directoryGiven = false;
  std::size_t at = 0;
  for (; at < args.size() && !args[at].empty() && args[at][0] == '-'; ++at) {
    const std::string& word = args[at];
    if (word == "--") {
      ++at;
      break;
    }
    if (word == "--help" || word == "-h") {
      options.help = true;
      continue;
    }
    if (word == "--version") {
      options.version = true;
      continue;
    }
    const std::string::size_type equals = word.find('=');
    const std::string name = word.substr(0, equals);
    std::string* target = nullptr;
    bool* given = nullptr;
    if (name == "--formatter" || word == "-o") {
      target = &options.formatter;
      given = &formatterGiven;
    } else if (name == "--plugin-dir") {
      target = &options.pluginDirectory;
      given = &directoryGiven;
    } else {
      throw UsageError("Unknown global option " + Fendle::Text::Echo(word) +
                       Fendle::Text::SuggestionText(Fendle::Text::ClosestNames(
                           name, {"--formatter", "--plugin-dir", "--help", "--version"})));
    }
    const std::string shown = word == "-o" ? "--formatter" : name;
    if (*given) throw UsageError("Option " + shown + " is given more than once");
    *given = true;
    if (equals != std::string::npos) {
      *target = word.substr(equals + 1);
    } else if (at + 1 < args.size()) {
      *target = args[++at];
    }
    if (target->empty()) throw UsageError("Option " + shown + " needs a value");
  }
  if (formatterGiven) CheckFormatter(options.formatter);
  options.words.assign(args.begin() + static_cast<std::ptrdiff_t>(at), args.end());
  // "hyracli help WORDS" is "hyracli --help WORDS".
  if (!options.words.empty() && options.words.front() == kHelpWord) {
    options.help = true;
    options.words.erase(options.words.begin());
  }
  return options;
}

boost::shared_ptr<Namespace> NewRootNamespace() {
  boost::shared_ptr<Namespace> root = Namespace::New();
  root->SetName(kTool);
  root->SetDescription("Manage the Hyra host.");
  boost::shared_ptr<Namespace> storage = Namespace::New();
  storage->SetDescription("Storage related operations.");
  root->RegisterNamespaceNode(storage, "storage");
  return root;
}

int Dispatch(const GlobalOptions& options, const boost::shared_ptr<NamespaceNode>& root,
             std::ostream& out, std::ostream& err) {
  // "--help" (or "-h") anywhere among the words of the path asks for help.
  const auto asksHelp = [](const std::string& word) { return word == "--help" || word == "-h"; };
  std::vector<std::string> words;
  for (const std::string& word : options.words) {
    if (!asksHelp(word)) words.push_back(word);
  }
  const std::size_t unresolved = words.size();
  boost::shared_ptr<NamespaceNode> node = root->ResolveNode(words);
  std::size_t pathWords = unresolved - words.size();
  bool help = options.help;
  std::size_t at = 0;
  for (; at < options.words.size() && (pathWords > 0 || asksHelp(options.words[at])); ++at) {
    if (asksHelp(options.words[at])) {
      help = true;
    } else {
      --pathWords;
    }
  }
  if (node->GetType() == NodeType::Command) {
    boost::shared_ptr<Command> command = boost::dynamic_pointer_cast<Command>(node);
    if (!command) {
      WriteMessage(err, std::string(kTool) + ": '" + CommandLineOf(*node) +
                            "' is marked as a command but cannot be run");
      return kExitCommandFailed;
    }
    // After the path, "--help" counts only where an option is expected.
    std::vector<std::string> arguments(options.words.begin() + static_cast<std::ptrdiff_t>(at),
                                       options.words.end());
    std::string text;
    try {
      const Fendle::CommandLine::ArgumentParser parser(command->GetInputSpec());
      std::string formatter = options.formatter;
      try {
        // The global --formatter (-o) may also follow the command's own
        // options, where the command has no option of that name itself.
        for (const std::string& late : parser.TakeToolOption(arguments, kFormatterOption, "o")) {
          if (!formatter.empty()) throw UsageError("Option --formatter is given more than once");
          formatter = CheckFormatter(late);
        }
      } catch (const UsageError& e) {
        return ReportUsage(err, e.what(), CommandLineOf(*command));
      }
      if (!help) help = parser.AsksForHelp(arguments);
      if (!help) return RunCommand(*command, arguments, formatter, out, err);
      text = command->GenerateHelpOutput();
    } catch (...) {
      return ReportCommandException(err);
    }
    out << text;
    return kExitOk;
  }
  // "help" after a namespace's words lists it, unless it names a child.
  if (words.size() == 1 && words.front() == kHelpWord) words.clear();
  if (!words.empty()) {
    const std::string where = CommandLineOf(*node);
    if (words.front()[0] == '-') {
      return ReportUsage(
          err,
          "'" + where + "' is a namespace and takes no option " + Fendle::Text::Echo(words.front()),
          where);
    }
    return ReportUsage(err,
                       "Unknown namespace or command " + Fendle::Text::Echo(words.front()) +
                           " in '" + where + "'" +
                           Fendle::Text::SuggestionText(Fendle::Text::ClosestNames(
                               words.front(), node->GetNamespaceNodeNames())),
                       where);
  }
  ListNamespace(*node, out);
  return kExitOk;
}

void WriteVersions(const std::vector<PluginVersion>& plugins, std::ostream& out) {
  out << kTool << " " << HYRA_VERSION << "\n";
  for (const PluginVersion& plugin : plugins) {
    out << plugin.name << " " << (plugin.version.empty() ? "(no version)" : plugin.version) << "\n";
  }
}

namespace {

// Says what may help after a plug-in failed to register.
void WritePluginHints(const std::string& failure, std::ostream& err) {
  // The daemon library's opening fails this way when the simulated Tarnd is stopped.
  if (failure.find("Unable to initialize tarnLib") != std::string::npos) {
    WriteMessage(err, std::string(kTool) +
                          ": hint: if the simulated Tarnd is stopped, start it with "
                          "'hyrasim daemon start'");
  }
}

// True for a run that needs no plug-in: the versions, and help asked for the
// root itself ("hyracli --help"; a bare "hyracli" still fails as it did).
bool NeedsNoPlugin(const GlobalOptions& options) {
  return options.version || (options.help && options.words.empty());
}

int LoadAndDispatch(const GlobalOptions& options, std::ostream& out, std::ostream& err) {
  // Declared before the tree so that it is destroyed after it: command objects
  // must die while the libraries holding their code are still loaded.
  PluginLoader loader;
  boost::shared_ptr<Namespace> root = NewRootNamespace();
  std::string directory;
  try {
    directory = PluginDirectory(options.pluginDirectory);
    loader.LoadDirectory(directory, root);
  } catch (const PluginError& e) {
    WriteMessage(err, std::string(kTool) + ": " + e.what());
    WritePluginHints(e.what(), err);
    // The root's help and the versions still answer, from what did load.
    if (!NeedsNoPlugin(options)) return kExitPlugin;
  }
  if (options.version) {
    WriteVersions(loader.Versions(), out);
    return kExitOk;
  }
  // The tool's own word, unless a plug-in took that name.
  if (!options.words.empty() && options.words.front() == kCompletionWord &&
      !root->HasNamespaceNode(kCompletionWord)) {
    std::vector<std::string> rest(options.words.begin() + 1, options.words.end());
    if (options.help) rest.push_back("--help");
    return RunCompletion(rest, root, out, err);
  }
  const int status = Dispatch(options, root, out, err);
  if (status == kExitUsage && loader.Versions().empty()) {
    WriteMessage(err, std::string(kTool) + ": no plug-in was loaded from " + directory +
                          " (plug-ins are its *.plugin.so files)");
  }
  return status;
}

}  // namespace

int Run(const std::vector<std::string>& args, const boost::shared_ptr<NamespaceNode>& root,
        std::ostream& out, std::ostream& err) {
  GlobalOptions options;
  if (!ParseOrReport(args, options, err)) return kExitUsage;
  if (options.version) {
    WriteVersions({}, out);
    return kExitOk;
  }
  return Dispatch(options, root, out, err);
}

int Main(const std::vector<std::string>& args, std::ostream& out, std::ostream& err) {
  GlobalOptions options;
  if (!ParseOrReport(args, options, err)) return kExitUsage;
  const int status = LoadAndDispatch(options, out, err);
  // Output that could not be written is a failure, as for any other tool
  // (a full disk, a closed descriptor); the exit status must not hide it.
  out.flush();
  if (out.fail()) {
    const int error = errno;
    WriteMessage(err, std::string(kTool) + ": cannot write the output: " +
                          (error != 0 ? std::strerror(error) : "write error"));
    return status != kExitOk ? status : kExitCommandFailed;
  }
  return status;
}

}  // namespace Hyracli

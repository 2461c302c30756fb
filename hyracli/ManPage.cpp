#include "hyracli/ManPage.h"

#include <algorithm>
#include <cctype>
#include <fstream>
#include <sstream>
#include <stdexcept>

#include "fendle/Formatter.h"
#include "hyracli/Completion.h"
#include "hyracli/HyraCli.h"
#include "hyracli/PluginLoader.h"
#include "hyracli/ToolOptionList.h"
#include "hyracli/TreeWalk.h"

namespace Hyracli {

namespace {

using Fendle::AutoCli::Command;
using Fendle::AutoCli::NamespaceNode;

const char kManual[] = "Hyra host commands";

// Text as roff reads it literally: a backslash is written as \e, and a dash as
// \- where it is part of something to type (an option, a command word).
std::string Escape(const std::string& text, bool typed) {
  std::string escaped;
  for (char c : text) {
    if (c == '\\') {
      escaped += "\\e";
    } else if (c == '-' && typed) {
      escaped += "\\-";
    } else {
      escaped += c;
    }
  }
  return escaped;
}

std::string Typed(const std::string& text) { return Escape(text, true); }

// A paragraph of free text, line by line: a line starting with a period or an
// apostrophe would be read as a request, and blanks at a line's ends and empty
// lines would each be a warning, so they become a break or are dropped.
void WriteText(const std::string& text, std::ostream& out) {
  std::istringstream lines(text);
  std::string line;
  bool first = true;
  while (std::getline(lines, line)) {
    const std::size_t begin = line.find_first_not_of(" \t");
    const std::size_t end = line.find_last_not_of(" \t");
    if (begin == std::string::npos) continue;
    line = line.substr(begin, end - begin + 1);
    if (!first) out << ".br\n";
    first = false;
    if (line[0] == '.' || line[0] == '\'') out << "\\&";
    out << Escape(line, false) << "\n";
  }
}

void WriteHeader(const std::string& name, const ManPageInfo& info, std::ostream& out) {
  std::string title = name;
  std::transform(title.begin(), title.end(), title.begin(),
                 [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
  out << ".TH " << Typed(title) << " 1 " << info.date << " \"hyracli " << info.version << "\" \""
      << kManual << "\"\n";
}

// The first line of a description, for the NAME line and the command list.
std::string Summary(const std::string& description) {
  const std::string line = description.substr(0, description.find('\n'));
  const std::size_t begin = line.find_first_not_of(" \t");
  return begin == std::string::npos ? std::string() : line.substr(begin);
}

std::string FormatterList() {
  std::string list;
  for (const std::string& name : Fendle::Format::FormatterNames()) {
    list += (list.empty() ? "\\fB" : ", \\fB") + Typed(name) + "\\fR";
  }
  return list;
}

void WriteGlobalOptions(std::ostream& out) {
  for (const ToolOption& option : ToolOptionList()) {
    out << ".TP\n\\fB\\-\\-" << Typed(option.name) << "\\fR";
    if (!option.alias.empty()) out << ", \\fB\\-" << Typed(option.alias) << "\\fR";
    if (option.value == ToolOptionValue::Formatter) out << " \\fIname\\fR";
    if (option.value == ToolOptionValue::Directory) out << " \\fIdirectory\\fR";
    out << "\n";
    std::string help = option.help + ".";
    help[0] = static_cast<char>(std::toupper(static_cast<unsigned char>(help[0])));
    WriteText(help, out);
    if (option.value == ToolOptionValue::Formatter) {
      out << "One of " << FormatterList() << ".\n";
    }
  }
}

struct ExitStatusText {
  int status;
  const char* text;
};

const ExitStatusText kExitStatuses[] = {
    {kExitOk, "Success."},
    {kExitCommandFailed,
     "The command reported an error, or an exception left it; the error text is on standard "
     "error and nothing is on standard output."},
    {kExitUsage, "Usage error: the command line could not be run as written."},
    {kExitPlugin,
     "A plug-in could not be loaded or registered (for example because the Tarnd daemon is "
     "stopped)."},
};

void WriteCommonSections(std::ostream& out) {
  out << ".SH EXIT STATUS\n";
  for (const ExitStatusText& entry : kExitStatuses) {
    out << ".TP\n.B " << entry.status << "\n" << entry.text << "\n";
  }
  out << ".SH ENVIRONMENT\n"
         ".TP\n.B HYRA_SIM_DB\n"
         "The simulated host's world, an SQLite file that its first use fills with the demo "
         "world.\n"
         "Without it the world is \\fI$XDG_STATE_HOME/hyrasim/world.db\\fR, else "
         "\\fI~/.local/state/hyrasim/world.db\\fR.\n"
         ".TP\n.B HYRACLI_PLUGIN_DIR\n"
         "The directory whose \\fI*.plugin.so\\fR files are loaded, when "
         "\\fB\\-\\-plugin\\-dir\\fR is not given.\n"
         "Without either, the plug-ins are those of \\fI"
      << Typed(PluginSubdirectory()) << "\\fR from the directory holding \\fBhyracli\\fR.\n";
}

std::string PathOf(const NamespaceNode& node) { return node.GetPathString(' '); }

// The page with every text line longer than kWidth bytes broken at blanks,
// which in filled text reads the same. Requests stay as they are.
std::string Wrapped(const std::string& page) {
  const std::size_t kWidth = 80;
  std::istringstream lines(page);
  std::string wrapped, line;
  while (std::getline(lines, line)) {
    if (!line.empty() && line[0] != '.') {
      while (line.size() > kWidth) {
        const std::size_t blank = line.rfind(' ', kWidth);
        if (blank == std::string::npos || blank == 0) break;
        wrapped += line.substr(0, blank) + "\n";
        line = line.substr(blank + 1);
        // A line of its own that starts like a request would be read as one.
        if (!line.empty() && (line[0] == '.' || line[0] == '\'')) line = "\\&" + line;
      }
    }
    wrapped += line + "\n";
  }
  return wrapped;
}

}  // namespace

std::string ManPageName(const NamespaceNode& node) {
  std::string name = "hyracli";
  if (!node.GetParent()) return name;
  for (const std::string& word : node.GetPath()) name += "-" + word;
  return name;
}

void WriteToolManPage(const boost::shared_ptr<NamespaceNode>& root, const ManPageInfo& info,
                      std::ostream& page) {
  std::ostringstream out;
  WriteHeader("hyracli", info, out);
  out << ".SH NAME\nhyracli \\- " << Escape(Summary(root->GetDescription()), false) << "\n"
      << ".SH SYNOPSIS\n"
         ".B hyracli\n"
         ".RI [ \"global options\" ]\n"
         ".I namespace\n"
         "\\&...\n"
         ".I command\n"
         ".RI [ options ]\n"
         ".br\n"
         ".B hyracli " << kCompletionWord << "\n"
         ".BR";
  for (std::size_t i = 0; i < CompletionShells().size(); ++i) {
    out << (i == 0 ? " " : " | ") << Typed(CompletionShells()[i]);
  }
  out << "\n.SH DESCRIPTION\n";
  WriteText(root->GetDescription(), out);
  out << ".PP\n"
         "The commands come from plug-ins, loaded at start from the plug-in directory (see\n"
         ".BR ENVIRONMENT ).\n"
         "The words name a namespace or a command of the tree they registered; a namespace\n"
         "alone, or any words followed by \\fB\\-\\-help\\fR, prints help.\n"
         "A command's options follow its words, as \\fB\\-\\-name\\fR \\fIvalue\\fR,\n"
         "\\fB\\-\\-name=\\fR\\fIvalue\\fR or \\fB\\-a\\fR \\fIvalue\\fR;\n"
         "a Bool option takes \\fBtrue\\fR or \\fBfalse\\fR, and a list option is repeated.\n"
         "The result goes to standard output, error texts to standard error.\n"
         ".PP\n"
         ".B hyracli " << kCompletionWord << "\n"
         "prints a completion script for the named shell, made from the commands loaded now.\n"
         ".SH OPTIONS\n"
         "These global options stand before the words.\n";
  WriteGlobalOptions(out);
  out << ".SH COMMANDS\n";
  std::vector<std::string> pages;
  VisitTree(root, [&out, &pages](const boost::shared_ptr<NamespaceNode>& node) {
    if (!AsCommand(node)) return;
    out << ".TP\n.B " << Typed(PathOf(*node)) << "\n";
    WriteText(Summary(node->GetDescription()), out);
    out << ".br\nSee\n.BR " << Typed(ManPageName(*node)) << " (1).\n";
    pages.push_back(ManPageName(*node));
  });
  WriteCommonSections(out);
  out << ".SH SEE ALSO\n";
  for (std::size_t i = 0; i < pages.size(); ++i) {
    out << ".BR " << Typed(pages[i]) << " (1)" << (i + 1 < pages.size() ? "," : "") << "\n";
  }
  if (pages.empty()) out << ".BR hyrasim (1)\n";
  page << Wrapped(out.str());
}

void WriteCommandManPage(Command& command, const ManPageInfo& info, std::ostream& page) {
  std::ostringstream out;
  const std::string name = ManPageName(command);
  // Held here: the parameters belong to the input declaration, which may be made per call.
  boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = command.GetInputSpec();
  const auto& parameters = spec->GetParameters();

  WriteHeader(name, info, out);
  const std::string summary = Summary(command.GetDescription());
  out << ".SH NAME\n"
      << Typed(name) << " \\- "
      << Escape(summary.empty() ? "the " + PathOf(command) + " command" : summary, false) << "\n"
      << ".SH SYNOPSIS\n"
      << ".B hyracli " << Typed(PathOf(command)) << "\n";
  for (const auto& parameter : parameters) {
    const std::string type = Fendle::CallSpec::ParameterTypeName(parameter->GetType());
    const bool flag = parameter->GetType() == Fendle::CallSpec::ParameterType::Flag;
    out << (parameter->IsRequired() ? "" : "[") << "\\fB\\-\\-" << Typed(parameter->GetName())
        << "\\fR" << (flag ? "" : " \\fI" + Typed(type) + "\\fR")
        << (parameter->IsRequired() ? "" : "]") << "\n";
  }
  out << ".SH DESCRIPTION\n";
  WriteText(command.GetDescription().empty() ? summary : command.GetDescription(), out);
  const boost::shared_ptr<NamespaceNode> parent = command.GetParent();
  if (parent && parent->GetParent()) {
    out << ".PP\nPart of\n.B " << Typed(PathOf(*parent)) << "\n";
    if (!Summary(parent->GetDescription()).empty()) {
      out << "(" << Escape(Summary(parent->GetDescription()), false) << ")\n";
    }
  }
  const std::string formatter =
      command.GetDefaultOutputFormatter().empty() ? "simple" : command.GetDefaultOutputFormatter();
  out << ".PP\nThe result is rendered by the \\fB" << Typed(formatter)
      << "\\fR formatter unless \\fB\\-\\-formatter\\fR names another\n(" << FormatterList()
      << ").\n";

  out << ".SH OPTIONS\n";
  for (const auto& parameter : parameters) {
    const bool flag = parameter->GetType() == Fendle::CallSpec::ParameterType::Flag;
    out << ".TP\n\\fB\\-\\-" << Typed(parameter->GetName()) << "\\fR";
    if (!parameter->GetAlias().empty()) out << ", \\fB\\-" << Typed(parameter->GetAlias()) << "\\fR";
    if (!flag) {
      out << " \\fI" << Typed(Fendle::CallSpec::ParameterTypeName(parameter->GetType())) << "\\fR";
    }
    out << "\n" << (parameter->IsRequired() ? "Required." : "Optional.") << "\n";
    if (!parameter->GetHelp().empty()) {
      out << ".br\n";
      WriteText(parameter->GetHelp(), out);
    }
  }
  out << ".TP\n\\fB\\-\\-help\\fR\nShow the command's help and do nothing else.\n";
  WriteCommonSections(out);
  out << ".SH SEE ALSO\n.BR hyracli (1)\n";
  page << Wrapped(out.str());
}

std::vector<std::string> WriteManPages(const boost::shared_ptr<NamespaceNode>& root,
                                       const std::string& directory, const ManPageInfo& info) {
  std::vector<std::string> files;
  auto write = [&directory, &files](const std::string& name, const std::string& text) {
    const std::string file = name + ".1";
    std::ofstream page(directory + "/" + file, std::ios::binary | std::ios::trunc);
    page << text;
    page.close();
    if (!page) throw std::runtime_error("cannot write " + directory + "/" + file);
    files.push_back(file);
  };
  std::ostringstream tool;
  WriteToolManPage(root, info, tool);
  write("hyracli", tool.str());
  VisitTree(root, [&info, &write](const boost::shared_ptr<NamespaceNode>& node) {
    boost::shared_ptr<Command> command = AsCommand(node);
    if (!command) return;
    std::ostringstream page;
    WriteCommandManPage(*command, info, page);
    write(ManPageName(*command), page.str());
  });
  return files;
}

}  // namespace Hyracli

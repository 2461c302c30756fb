// What the plug-in declares to the host: the tree in registration order with
// every namespace's description and, for each command, its class, metadata,
// formatter, hints, result prototype and parameters; then the classes that are
// not in the tree. Compared as one text, so that help and formatters can rely
// on every blank of it.
#include <boost/core/demangle.hpp>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <typeinfo>
#include <vector>

#include "CGAdd.h"
#include "CGCreate.h"
#include "CGDelete.h"
#include "CGList.h"
#include "CGSync.h"
#include "DaemonCommand.h"
#include "PluginTestSupport.h"
#include "TarnLibSim.h"
#include "TarnNamespace.h"

namespace PluginTest {
namespace {

using namespace HalvikCli::TarnNamespace;
using Fendle::AutoCli::Command;
using Fendle::AutoCli::Namespace;
using Fendle::AutoCli::NamespaceNode;
using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaObject;
using Fendle::MetaObj::MetaStruct;
typedef boost::shared_ptr<NamespaceNode> NodePtr;

void DumpCommand(const std::string& where, Command& command, std::ostream& out) {
  const std::string cls = boost::core::demangle(typeid(command).name());
  out << where << ": " << cls.substr(cls.rfind(':') + 1) << " \"" << command.GetDescription()
      << "\"\n  ";
  for (const auto& field : command.GetMetaData()) out << field.first << "=" << field.second << " ";
  out << "formatter=" << command.GetDefaultOutputFormatter() << "\n";
  for (const auto& hint : command.GetDefaultOutputFormatParameters()) {
    out << "  hint " << hint.first << " = " << hint.second << "\n";
  }
  out << "  result " << Describe(command.GetOutputSpec()->GetResultType()) << "\n";
  const boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = command.GetInputSpec();
  for (const auto& p : spec->GetParameters()) {
    out << "  --" << p->GetName() << (p->GetAlias().empty() ? "" : " -" + p->GetAlias()) << " "
        << Fendle::CallSpec::ParameterTypeName(p->GetType()) << " "
        << (p->IsRequired() ? "required" : "optional") << " \"" << p->GetHelp() << "\"\n";
  }
}

void DumpNode(const NodePtr& node, const std::string& path, std::ostream& out) {
  if (auto command = boost::dynamic_pointer_cast<Command>(node)) {
    DumpCommand(path, *command, out);
    return;
  }
  out << path << " (namespace) \"" << node->GetDescription() << "\"\n";
  for (const NodePtr& child : node->GetNamespaceNodes()) {
    DumpNode(child, path + " " + child->GetName(), out);
  }
}

// The expected declarations, kept as a plain text beside this file.
std::string ExpectedDeclarations() {
  std::ifstream file(PLUGIN_TEST_DATA_DIR "/Declarations.txt", std::ios::binary);
  EXPECT_TRUE(file) << "cannot read " PLUGIN_TEST_DATA_DIR "/Declarations.txt";
  std::ostringstream text;
  text << file.rdbuf();
  return text.str();
}

std::vector<std::string> SplitAtCommas(const std::string& text) {
  std::vector<std::string> parts;
  std::istringstream stream(text);
  for (std::string part; std::getline(stream, part, ',');) parts.push_back(part);
  return parts;
}

// Every structure the result declares, by name, with its field names.
void CollectStructures(const boost::shared_ptr<MetaObject>& value,
                       std::map<std::string, std::set<std::string> >& structures) {
  if (auto structure = boost::dynamic_pointer_cast<MetaStruct>(value)) {
    std::set<std::string>& names = structures[structure->GetName()];
    for (const auto& field : structure->GetFields()) {
      names.insert(field.first);
      CollectStructures(field.second, structures);
    }
  } else if (auto list = boost::dynamic_pointer_cast<MetaList>(value)) {
    CollectStructures(list->GetPrototype(), structures);
  }
}

// The mistakes in a command's output hints: a structure or field that the
// declared result does not have, which would hide a column or a unit.
std::vector<std::string> HintMistakes(Command& command) {
  std::map<std::string, std::set<std::string> > structures;
  const boost::shared_ptr<MetaObject> result = command.GetOutputSpec()->GetResultType();
  CollectStructures(result, structures);
  std::vector<std::string> mistakes;
  const auto check = [&](const std::string& hint, const std::string& structure,
                         const std::vector<std::string>& fields) {
    const auto found = structures.find(structure);
    if (found == structures.end()) {
      mistakes.push_back(hint + ": no structure " + structure);
      return;
    }
    for (const std::string& field : fields) {
      if (!found->second.count(field)) mistakes.push_back(hint + ": no field " + field);
    }
  };
  for (const auto& [key, value] : command.GetDefaultOutputFormatParameters()) {
    const std::string kind = key.substr(0, key.find(':') + 1);
    const std::string subject = key.substr(kind.size());
    if (kind == "fields:") {
      check(key, subject, SplitAtCommas(value));
    } else if (kind == "header:") {
      std::vector<std::string> references;
      for (std::size_t open = value.find('%'); open != std::string::npos;) {
        const std::size_t close = value.find('%', open + 1);
        if (close == std::string::npos) break;
        references.push_back(value.substr(open + 1, close - open - 1));
        open = value.find('%', close + 1);
      }
      check(key, subject, references);
    } else if (kind == "units:") {
      const std::size_t dot = subject.find('.');
      check(key, subject.substr(0, dot), {subject.substr(dot + 1)});
    } else if (key == "table-columns") {
      const auto* row = boost::dynamic_pointer_cast<MetaList>(result)
                            ? boost::dynamic_pointer_cast<MetaStruct>(
                                  boost::dynamic_pointer_cast<MetaList>(result)->GetPrototype())
                                  .get()
                            : boost::dynamic_pointer_cast<MetaStruct>(result).get();
      check(key, row ? row->GetName() : std::string(), SplitAtCommas(value));
    } else {
      mistakes.push_back(key + ": not a hint the formatters know");
    }
  }
  return mistakes;
}

void CollectCommands(const NodePtr& node, const std::string& path,
                     std::vector<std::pair<std::string, boost::shared_ptr<Command> > >& commands) {
  if (auto command = boost::dynamic_pointer_cast<Command>(node)) {
    commands.emplace_back(path, command);
    return;
  }
  for (const NodePtr& child : node->GetNamespaceNodes()) {
    CollectCommands(child, path + " " + child->GetName(), commands);
  }
}

class DeclarationTest : public SimWorldTest {};

TEST_F(DeclarationTest, TreeAndClassesDeclareExactlyWhatTheHostShows) {
  boost::shared_ptr<Namespace> root = Namespace::New();
  root->RegisterNamespaceNode(Namespace::New(), "storage");
  AutoCli_RegisterNamespaces(root);
  // Seven commands hold the daemon client library while the tree lives.
  EXPECT_EQ(TarnLibSim_Openings(), 7);

  std::ostringstream dump;
  DumpNode(root->GetNamespaceNode("storage")->GetNamespaceNode("internal"), "internal", dump);
  DumpCommand("not in tree", *CGAdd::New(), dump);
  DumpCommand("not in tree", *CGCreate::New(), dump);
  DumpCommand("not in tree", *CGDelete::New(), dump);
  DumpCommand("not in tree", *CGList::New(), dump);
  DumpCommand("not in tree", *CGSync::New(), dump);
  EXPECT_EQ(dump.str(), ExpectedDeclarations());

  root.reset();
  EXPECT_EQ(TarnLibSim_Openings(), 0);
}

TEST_F(DeclarationTest, EveryOutputHintNamesWhatTheResultHas) {
  boost::shared_ptr<Namespace> root = Namespace::New();
  root->RegisterNamespaceNode(Namespace::New(), "storage");
  AutoCli_RegisterNamespaces(root);
  std::vector<std::pair<std::string, boost::shared_ptr<Command> > > commands;
  CollectCommands(root->GetNamespaceNode("storage"), "storage", commands);
  commands.emplace_back("CGAdd", CGAdd::New());
  commands.emplace_back("CGCreate", CGCreate::New());
  commands.emplace_back("CGDelete", CGDelete::New());
  commands.emplace_back("CGList", CGList::New());
  commands.emplace_back("CGSync", CGSync::New());
  ASSERT_EQ(commands.size(), 27u);
  for (const auto& [path, command] : commands) {
    std::vector<std::string> expected;
    // Declared so by the host's own command: the heading names "CgSync".
    if (path == "CGSync") expected.push_back("header:CgSync: no structure CgSync");
    EXPECT_EQ(HintMistakes(*command), expected) << path;
  }
}

TEST_F(DeclarationTest, LogLevelWordsMapToTheDaemonsNumbers) {
  const std::pair<std::string, int32_t> cases[] = {
      {"panic", 2},    {"quiet", 1},   {"error", 4}, {"warning", 8}, {"WARNING", 8}, {"info", 16},
      {"Verbose", 32}, {"trivia", 64}, {"loud", 4},  {"", 4},        {"panic ", 4},
  };
  boost::shared_ptr<DaemonCommand> command = DaemonCommand::New();
  for (const auto& c : cases) {
    EXPECT_EQ(command->GetLogLevelInt(c.first), c.second) << '"' << c.first << '"';
  }
}

}  // namespace
}  // namespace PluginTest

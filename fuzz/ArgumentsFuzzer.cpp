// Feeds hyracli's command line handling with arbitrary words: the input is
// the words separated by NUL bytes. Everything short of running a command is
// done on the tree the plug-in registers: global options, resolving the path
// (with help and listings of namespaces), and parsing a command's options.
// Commands are not run, so that every input gives the same answer.
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"
#include "OwnDirectory.h"
#include "TarnNamespace.h"
#include "World.h"
#include "fendle/ArgumentParser.h"
#include "hyracli/HyraCli.h"

namespace {

boost::shared_ptr<Fendle::AutoCli::Namespace> BuildTree() {
  // Seven commands open the daemon client when the tree is built; they get a
  // world of their own, never the user's.
  static const OwnDirectory directory;
  setenv("HYRA_SIM_DB", directory.File("world.db").c_str(), 1);
  HyraSim::InitDemo();
  boost::shared_ptr<Fendle::AutoCli::Namespace> root = Hyracli::NewRootNamespace();
  AutoCli_RegisterNamespaces(root);
  return root;
}

std::vector<std::string> Words(const uint8_t* data, size_t size) {
  std::vector<std::string> words(1);
  for (size_t i = 0; i < size; ++i) {
    if (data[i] == 0) {
      words.emplace_back();
    } else {
      words.back().push_back(static_cast<char>(data[i]));
    }
  }
  return words;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static const boost::shared_ptr<Fendle::AutoCli::Namespace> root = BuildTree();
  Hyracli::GlobalOptions options;
  try {
    options = Hyracli::ParseGlobalOptions(Words(data, size));
  } catch (const Fendle::CommandLine::UsageError&) {
    return 0;
  }
  std::vector<std::string> path;
  for (const std::string& word : options.words) {
    if (word != "--help") path.push_back(word);
  }
  const size_t given = path.size();
  boost::shared_ptr<Fendle::AutoCli::NamespaceNode> node = root->ResolveNode(path);
  boost::shared_ptr<Fendle::AutoCli::Command> command =
      boost::dynamic_pointer_cast<Fendle::AutoCli::Command>(node);
  if (!command) {
    // A namespace: the tool only lists it or reports a usage error.
    std::ostringstream out, err;
    Hyracli::Dispatch(options, root, out, err);
    return 0;
  }
  // The command's own words: those after its path (without "--help").
  std::vector<std::string> arguments;
  size_t pathWords = given - path.size();
  for (const std::string& word : options.words) {
    if (pathWords > 0) {
      if (word != "--help") --pathWords;
      continue;
    }
    arguments.push_back(word);
  }
  const Fendle::CommandLine::ArgumentParser parser(command->GetInputSpec());
  if (parser.AsksForHelp(arguments)) {
    command->GenerateHelpOutput();
    return 0;
  }
  try {
    parser.Parse(arguments);
  } catch (const Fendle::CommandLine::UsageError&) {
  }
  return 0;
}

#include <sstream>

#include "Fendle/AutoCli.h"

namespace Fendle {
namespace AutoCli {

namespace {

// Sets key to value in place when present, else appends it, keeping first-set order.
void Put(Command::Pairs& pairs, const std::string& key, const std::string& value) {
  for (auto& pair : pairs) {
    if (pair.first == key) {
      pair.second = value;
      return;
    }
  }
  pairs.emplace_back(key, value);
}

// The words a user types to reach node: the root's name (the tool) and the path.
std::string CommandLineOf(const NamespaceNode& node) {
  boost::shared_ptr<NamespaceNode> root = node.GetParent();
  while (root && root->GetParent()) root = root->GetParent();
  std::string path = node.GetPathString(' ');
  if (!root) return node.GetName();
  if (root->GetName().empty()) return path;
  return root->GetName() + " " + path;
}

}  // namespace

Command::~Command() = default;

boost::shared_ptr<CallSpec::InputSpec> Command::GetInputSpec() {
  boost::shared_ptr<CallSpec::InputSpec> spec = GetInputSpecInternal();
  return spec ? spec : CallSpec::InputSpec::New();
}

boost::shared_ptr<CallSpec::OutputSpec> Command::GetOutputSpec() {
  boost::shared_ptr<CallSpec::OutputSpec> spec = GetOutputSpecInternal();
  return spec ? spec : CallSpec::OutputSpec::New();
}

void Command::Execute(const boost::shared_ptr<CallSpec::Input>& input,
                      const boost::shared_ptr<CallSpec::Output>& output) {
  // Commands read their input without checking for a missing one.
  ExecuteInternal(input ? input : CallSpec::Input::New(), output);
}

NodeType Command::GetType() const { return NodeType::Command; }

const Command::Pairs& Command::GetExamples() const { return examples_; }

void Command::AddExample(const std::string& commandLine, const std::string& explanation) {
  examples_.emplace_back(commandLine, explanation);
}

std::string Command::GetDefaultOutputFormatter() const { return formatter_; }

void Command::SetDefaultOutputFormatter(const std::string& formatter) { formatter_ = formatter; }

const Command::Pairs& Command::GetDefaultOutputFormatParameters() const {
  return formatParameters_;
}

void Command::SetDefaultOutputParameter(const std::string& key, const std::string& value) {
  Put(formatParameters_, key, value);
}

void Command::SetMetaDataField(const std::string& key, const std::string& value) {
  Put(metaData_, key, value);
}

std::string Command::GetMetaDataField(const std::string& key) const {
  for (const auto& pair : metaData_) {
    if (pair.first == key) return pair.second;
  }
  return std::string();
}

const Command::Pairs& Command::GetMetaData() const { return metaData_; }

std::string Command::GenerateHelpOutput() {
  // Descriptions and help texts are written exactly as declared: some carry
  // deliberate blanks, quotes or line feeds that a reader may need to see.
  std::ostringstream help;
  // Held here: the parameters belong to the input specification, which may be made per call.
  boost::shared_ptr<CallSpec::InputSpec> spec = GetInputSpec();
  const std::vector<boost::shared_ptr<CallSpec::ParameterSpec> >& parameters =
      spec->GetParameters();
  help << "Usage: " << CommandLineOf(*this) << (parameters.empty() ? "" : " [options]") << "\n";
  if (!GetDescription().empty()) help << "\n" << GetDescription() << "\n";
  help << "\n";
  if (parameters.empty()) {
    help << "Options: none\n";
  } else {
    help << "Options:\n";
    for (const auto& parameter : parameters) {
      help << "  --" << parameter->GetName();
      if (!parameter->GetAlias().empty()) help << ", -" << parameter->GetAlias();
      help << "  " << CallSpec::ParameterTypeName(parameter->GetType()) << "  "
           << (parameter->IsRequired() ? "required" : "optional") << "\n";
      if (!parameter->GetHelp().empty()) help << "      " << parameter->GetHelp() << "\n";
    }
  }
  if (!examples_.empty()) {
    help << "\nExamples:\n";
    for (const auto& example : examples_) {
      help << "  " << example.first << "\n";
      if (!example.second.empty()) help << "      " << example.second << "\n";
    }
  }
  return help.str();
}

boost::shared_ptr<CallSpec::InputSpec> Command::GetInputSpecInternal() {
  return CallSpec::InputSpec::New();
}

boost::shared_ptr<CallSpec::OutputSpec> Command::GetOutputSpecInternal() {
  return CallSpec::OutputSpec::New();
}

void Command::ExecuteInternal(const boost::shared_ptr<CallSpec::Input>& /*input*/,
                              const boost::shared_ptr<CallSpec::Output>& output) {
  std::string path = GetPathString(' ');
  const std::string name = path.empty() ? GetName() : path;
  output->SetError(name.empty() ? "This command is not implemented."
                                : "The command '" + name + "' is not implemented.");
}

}  // namespace AutoCli
}  // namespace Fendle

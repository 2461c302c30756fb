// A command whose specifications and work are set by the test.
#pragma once

#include <functional>
#include <string>

#include "Fendle/AutoCli.h"

namespace FendleTest {

using In = boost::shared_ptr<Fendle::CallSpec::Input>;
using Out = boost::shared_ptr<Fendle::CallSpec::Output>;

class TestCommand : public Fendle::AutoCli::Command {
 public:
  using Body = std::function<void(const In&, const Out&)>;

  // Without a body or an input specification the framework's defaults answer.
  static boost::shared_ptr<TestCommand> New(
      const std::string& description = "", const Body& body = nullptr,
      const boost::shared_ptr<Fendle::CallSpec::InputSpec>& spec = nullptr) {
    boost::shared_ptr<TestCommand> command(new TestCommand());
    command->SetDescription(description);
    command->body_ = body;
    command->spec_ = spec;
    return command;
  }
  int runs_ = 0;

 protected:
  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override {
    return spec_ ? spec_ : Command::GetInputSpecInternal();
  }
  void ExecuteInternal(const In& input, const Out& output) override {
    ++runs_;
    body_ ? body_(input, output) : Command::ExecuteInternal(input, output);
  }

 private:
  TestCommand() = default;
  Body body_;
  boost::shared_ptr<Fendle::CallSpec::InputSpec> spec_;
};

// An InputSpec from (name, type, alias, required, help) rows.
struct Row {
  std::string name;
  Fendle::CallSpec::ParameterType type;
  std::string alias;
  bool required;
  std::string help;
};
inline boost::shared_ptr<Fendle::CallSpec::InputSpec> Spec(const std::vector<Row>& rows) {
  boost::shared_ptr<Fendle::CallSpec::InputSpec> spec = Fendle::CallSpec::InputSpec::New();
  for (const Row& row : rows) {
    auto parameter = Fendle::CallSpec::ParameterSpec::New(row.name, row.type);
    if (!row.alias.empty()) parameter->SetAlias(row.alias);
    parameter->SetHelp(row.help);
    parameter->SetRequired(row.required);
    spec->AddParameter(parameter);
  }
  return spec;
}

}  // namespace FendleTest

// A command whose specifications and work are set by the test.
#pragma once

#include <boost/shared_ptr.hpp>
#include <functional>
#include <string>

#include "Fendle/AutoCli.h"

namespace FendleTest {

class TestCommand : public Fendle::AutoCli::Command {
 public:
  typedef std::function<void(const boost::shared_ptr<Fendle::CallSpec::Input>&,
                             const boost::shared_ptr<Fendle::CallSpec::Output>&)>
      Body;

  static boost::shared_ptr<TestCommand> New(const std::string& description = std::string()) {
    boost::shared_ptr<TestCommand> command(new TestCommand());
    command->SetDescription(description);
    return command;
  }

  // Without these the framework's defaults answer.
  void SetInput(const boost::shared_ptr<Fendle::CallSpec::InputSpec>& spec) { input_ = spec; }
  void SetOutput(const boost::shared_ptr<Fendle::CallSpec::OutputSpec>& spec) { output_ = spec; }
  void SetBody(const Body& body) { body_ = body; }
  int Runs() const { return runs_; }

 protected:
  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override {
    return input_ ? input_ : Command::GetInputSpecInternal();
  }
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override {
    return output_ ? output_ : Command::GetOutputSpecInternal();
  }
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override {
    ++runs_;
    if (body_) {
      body_(input, output);
    } else {
      Command::ExecuteInternal(input, output);
    }
  }

 private:
  TestCommand() = default;
  boost::shared_ptr<Fendle::CallSpec::InputSpec> input_;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> output_;
  Body body_;
  int runs_ = 0;
};

// A parameter in one call.
inline boost::shared_ptr<Fendle::CallSpec::ParameterSpec> Parameter(
    const std::string& name, Fendle::CallSpec::ParameterType type, const std::string& alias,
    bool required, const std::string& help = std::string()) {
  boost::shared_ptr<Fendle::CallSpec::ParameterSpec> parameter =
      Fendle::CallSpec::ParameterSpec::New(name, type);
  if (!alias.empty()) parameter->SetAlias(alias);
  parameter->SetHelp(help);
  parameter->SetRequired(required);
  return parameter;
}

}  // namespace FendleTest

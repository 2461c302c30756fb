#include "PluginTestSupport.h"

#include <cstdlib>
#include <filesystem>
#include <sstream>

#include "HostCtl/Lib.h"
#include "TarnLibSim.h"
#include "World.h"

namespace PluginTest {

using Fendle::MetaObj::MetaObject;
using Fendle::MetaObj::MetaType;

std::string Describe(const boost::shared_ptr<MetaObject>& value) {
  if (!value) return "null";
  std::ostringstream text;
  switch (value->GetType()) {
    case MetaType::Bool: {
      auto b = boost::dynamic_pointer_cast<Fendle::MetaObj::MetaBool>(value);
      text << (!b->HasValue() ? "bool" : b->GetValue() ? "true" : "false");
      break;
    }
    case MetaType::Int:
      text << boost::dynamic_pointer_cast<Fendle::MetaObj::MetaInt>(value)->GetValue();
      break;
    case MetaType::String:
      text << '"' << boost::dynamic_pointer_cast<Fendle::MetaObj::MetaString>(value)->GetValue()
           << '"';
      break;
    case MetaType::Struct: {
      auto s = boost::dynamic_pointer_cast<Fendle::MetaObj::MetaStruct>(value);
      text << s->GetName() << '{';
      const char* separator = "";
      for (const auto& field : s->GetFields()) {
        text << separator << field.first << '=' << Describe(field.second);
        separator = ",";
      }
      text << '}';
      break;
    }
    case MetaType::List: {
      auto l = boost::dynamic_pointer_cast<Fendle::MetaObj::MetaList>(value);
      text << '[';
      if (l->GetPrototype()) text << '<' << Describe(l->GetPrototype()) << '>';
      const char* separator = "";
      for (const auto& element : l->GetElements()) {
        text << separator << Describe(element);
        separator = ",";
      }
      text << ']';
      break;
    }
  }
  return text.str();
}

boost::shared_ptr<RecordingOutput> RecordingOutput::New(ThrowOn throwOn,
                                                        const std::string& message) {
  return boost::shared_ptr<RecordingOutput>(new RecordingOutput(throwOn, message));
}

RecordingOutput::RecordingOutput(ThrowOn throwOn, const std::string& message)
    : throwOn_(throwOn), message_(message) {}

void RecordingOutput::MaybeThrow(ThrowOn call) const {
  if (call == throwOn_) throw HostCtl::Lib::HostCtlException(message_, HostCtl::Lib::KelmMessage());
}

void RecordingOutput::SetError(const std::string& text) {
  calls_.push_back("error: " + text);
  MaybeThrow(ThrowOn::kError);
  Output::SetError(text);
}

void RecordingOutput::SetResult(const boost::shared_ptr<MetaObject>& result) {
  calls_.push_back("result: " + Describe(result));
  MaybeThrow(ThrowOn::kResult);
  Output::SetResult(result);
}

void RecordingOutput::Finish() {
  calls_.push_back("finish");
  MaybeThrow(ThrowOn::kFinish);
  Output::Finish();
}

InputPtr MakeInput(const InputFiller& filler) {
  InputPtr input = Fendle::CallSpec::Input::New();
  if (filler) filler(*input);
  return input;
}

std::vector<std::string> RunCommand(Fendle::AutoCli::Command& command, const InputFiller& filler) {
  boost::shared_ptr<RecordingOutput> output = RecordingOutput::New();
  command.Execute(MakeInput(filler), output);
  return output->Calls();
}

void SimWorldTest::SetUp() {
  std::string pattern = (std::filesystem::temp_directory_path() / "plugin-test-XXXXXX").string();
  ASSERT_NE(mkdtemp(pattern.data()), nullptr);
  directory_ = pattern;
  setenv("HYRA_SIM_DB", (directory_ + "/world.db").c_str(), 1);
  HyraSim::InitDemo();
  HyraSim::ClearFailures();
  TarnLibSim_ResetCounters();
}

void SimWorldTest::TearDown() {
  unsetenv("HYRA_SIM_DB");
  std::error_code ignored;
  std::filesystem::remove_all(directory_, ignored);
}

nlohmann::json SimWorldTest::World() { return nlohmann::json::parse(HyraSim::ExportScenario()); }

void SimWorldTest::LoadScenario(const nlohmann::json& scenario) {
  HyraSim::InitScenario(scenario.dump());
}

void SimWorldTest::Arm(const std::string& operation, const std::string& message, int64_t after,
                       bool null) {
  HyraSim::FailureSpec spec;
  spec.message = message;
  spec.after = after;
  spec.null = null;
  HyraSim::ArmFailure(operation, spec);
}

}  // namespace PluginTest

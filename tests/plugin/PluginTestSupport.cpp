#include "PluginTestSupport.h"

#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <utility>

#include "HostCtl/Lib.h"
#include "TarnLibSim.h"
#include "World.h"

namespace PluginTest {

using namespace Fendle::MetaObj;

std::string Describe(const boost::shared_ptr<MetaObject>& value) {
  std::ostringstream text;
  const char* separator = "";
  if (auto b = boost::dynamic_pointer_cast<MetaBool>(value)) {
    text << (!b->HasValue() ? "bool" : b->GetValue() ? "true" : "false");
  } else if (auto i = boost::dynamic_pointer_cast<MetaInt>(value)) {
    text << i->GetValue();
  } else if (auto s = boost::dynamic_pointer_cast<MetaString>(value)) {
    text << '"' << s->GetValue() << '"';
  } else if (auto st = boost::dynamic_pointer_cast<MetaStruct>(value)) {
    text << st->GetName() << '{';
    for (const auto& field : st->GetFields()) {
      text << std::exchange(separator, ",") << field.first << '=' << Describe(field.second);
    }
    text << '}';
  } else if (auto l = boost::dynamic_pointer_cast<MetaList>(value)) {
    text << '[';
    if (l->GetPrototype()) text << '<' << Describe(l->GetPrototype()) << '>';
    for (const auto& element : l->GetElements()) {
      text << std::exchange(separator, ",") << Describe(element);
    }
    text << ']';
  } else {
    text << "null";
  }
  return text.str();
}

InputFiller Args(const nlohmann::json& args) {
  return [args](Fendle::CallSpec::Input& in) {
    for (const auto& [name, value] : args.items()) {
      if (value.is_string()) in.SetString(name, value);
      if (value.is_number()) in.SetInt(name, value);
      if (value.is_boolean()) in.SetBool(name, value);
      if (value.is_null()) in.SetFlag(name);
      for (const auto& element : value.is_array() ? value : nlohmann::json::array()) {
        if (element.is_string()) in.AddString(name, element);
        if (element.is_number()) in.AddInt(name, element);
        if (element.is_boolean()) in.AddBool(name, element);
      }
    }
  };
}

void RecordingOutput::Record(const std::string& call, ThrowOn which) {
  calls_.push_back(call);
  if (which == throwOn_) {
    throw HostCtl::Lib::HostCtlException("sink failed", HostCtl::Lib::KelmMessage());
  }
}

void RecordingOutput::SetError(const std::string& text) {
  Record("error: " + text, ThrowOn::kError);
  Output::SetError(text);
}

void RecordingOutput::SetResult(const boost::shared_ptr<MetaObject>& result) {
  Record("result: " + Describe(result), ThrowOn::kResult);
  Output::SetResult(result);
}

void RecordingOutput::Finish() {
  Record("finish", ThrowOn::kFinish);
  Output::Finish();
}

Calls RunCommand(Fendle::AutoCli::Command& command, const InputFiller& filler,
                 RecordingOutput::ThrowOn throwOn) {
  boost::shared_ptr<Fendle::CallSpec::Input> input = Fendle::CallSpec::Input::New();
  if (filler) filler(*input);
  boost::shared_ptr<RecordingOutput> output = RecordingOutput::New(throwOn);
  command.Execute(input, output);
  return output->GetCalls();
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

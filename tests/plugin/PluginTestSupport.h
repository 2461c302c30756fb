// Shared pieces of the plug-in tests: a fresh simulated world per test, an
// Output sink that records every call in order, and a text form of result
// values that tables can name.
#pragma once

#include <gtest/gtest.h>

#include <boost/shared_ptr.hpp>
#include <functional>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"
#include "Fendle/CallSpec.h"
#include "Fendle/MetaObj.h"

namespace PluginTest {

typedef std::function<void(Fendle::CallSpec::Input&)> InputFiller;
typedef std::vector<std::string> Calls;

// A value as a short text: true, false, an unset bool as "bool", an int as its
// number, a string between double quotes, a structure as Name{field=value,...},
// a list as [..] (a prototype shown as <..>).
std::string Describe(const boost::shared_ptr<Fendle::MetaObj::MetaObject>& value);

// Parameters by long name: a text, number or bool sets one value, an array
// adds each of its elements in order, null gives a flag.
InputFiller Args(const nlohmann::json& args);

// Records SetError, SetResult and Finish as "error: <text>", "result: <value>"
// and "finish"; can be told to throw a HostCtlException from one of them.
class RecordingOutput : public Fendle::CallSpec::Output {
 public:
  enum class ThrowOn { kNothing, kError, kResult, kFinish };

  static boost::shared_ptr<RecordingOutput> New(ThrowOn throwOn = ThrowOn::kNothing) {
    return boost::shared_ptr<RecordingOutput>(new RecordingOutput(throwOn));
  }

  void SetError(const std::string& text) override;
  void SetResult(const boost::shared_ptr<Fendle::MetaObj::MetaObject>& result) override;
  void Finish() override;

  const Calls& GetCalls() const { return calls_; }

 private:
  explicit RecordingOutput(ThrowOn throwOn) : throwOn_(throwOn) {}
  void Record(const std::string& call, ThrowOn which);

  ThrowOn throwOn_;
  Calls calls_;
};

// Runs command with an input filled by filler; answers the recorded calls.
Calls RunCommand(Fendle::AutoCli::Command& command, const InputFiller& filler,
                 RecordingOutput::ThrowOn throwOn = RecordingOutput::ThrowOn::kNothing);

// The message of the E that action throws, or "no exception".
template <typename E>
std::string Thrown(const std::function<void()>& action) {
  try {
    action();
  } catch (const E& e) {
    return e.GetMessage(false);
  }
  return "no exception";
}

// Each test runs against its own world database in a fresh temporary
// directory, starting from the demo world, with no armed failures and with
// the daemon client library's counters at zero.
class SimWorldTest : public ::testing::Test {
 protected:
  void SetUp() override;
  void TearDown() override;

  // The world as the scenario export shows it.
  static nlohmann::json World();
  // Replaces the world.
  static void LoadScenario(const nlohmann::json& scenario);
  // Arms operation to fail once (after `after` passing calls) with message,
  // or to answer nothing when null is true.
  static void Arm(const std::string& operation, const std::string& message = "boom",
                  int64_t after = 0, bool null = false);

  std::string directory_;
};

}  // namespace PluginTest

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

typedef boost::shared_ptr<Fendle::CallSpec::Input> InputPtr;
typedef std::function<void(Fendle::CallSpec::Input&)> InputFiller;

// A value as a short text: true, false, an unset bool as "bool", an int as its
// number, a string between double quotes, a structure as Name{field=value,...},
// a list as [..] (a prototype shown as <..>).
std::string Describe(const boost::shared_ptr<Fendle::MetaObj::MetaObject>& value);

// Records SetError, SetResult and Finish as "error: <text>", "result: <value>"
// and "finish"; can be told to throw a HostCtlException from one of them.
class RecordingOutput : public Fendle::CallSpec::Output {
 public:
  enum class ThrowOn { kNothing, kError, kResult, kFinish };

  static boost::shared_ptr<RecordingOutput> New(ThrowOn throwOn = ThrowOn::kNothing,
                                                const std::string& message = "sink failed");

  void SetError(const std::string& text) override;
  void SetResult(const boost::shared_ptr<Fendle::MetaObj::MetaObject>& result) override;
  void Finish() override;

  const std::vector<std::string>& Calls() const { return calls_; }

 private:
  RecordingOutput(ThrowOn throwOn, const std::string& message);
  void MaybeThrow(ThrowOn call) const;

  ThrowOn throwOn_;
  std::string message_;
  std::vector<std::string> calls_;
};

// An Input filled by filler.
InputPtr MakeInput(const InputFiller& filler);

// Runs command with that input; answers the recorded calls.
std::vector<std::string> RunCommand(Fendle::AutoCli::Command& command, const InputFiller& filler);

// Each test runs against its own world database in a fresh temporary
// directory, starting from the given scenario, with no armed failures and
// with the daemon client library's counters at zero.
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
  static void Arm(const std::string& operation, const std::string& message = "injected failure",
                  int64_t after = 0, bool null = false);

  std::string directory_;
};

}  // namespace PluginTest

// hyrasim: sets up, shows and steers the simulated Hyra host that the stand-in
// host libraries run on.
#include <charconv>
#include <iostream>
#include <string>
#include <vector>

#include "Scenario.h"
#include "ScenarioFile.h"
#include "World.h"
#include "WorldText.h"

namespace {

const char kUsage[] =
    R"(Usage: hyrasim COMMAND [OPTIONS]

Sets up and steers the simulated Hyra host that hyracli's tarn commands run
against. The world lives in the file HYRA_SIM_DB, else in
$XDG_STATE_HOME/hyrasim/world.db (XDG_STATE_HOME defaults to ~/.local/state);
its first use creates the demo world.

Commands:
  init --demo             replace the world by the demo world
  init --scenario FILE    replace the world by the scenario in FILE (JSON)
  show [--json]           print the world; --json prints it as a scenario
  daemon start|stop       start or stop the simulated Tarnd
  fail OPERATION [--message TEXT] [--after N] [--times K] [--null]
                          make OPERATION fail: the first N calls pass (default
                          0), the next K calls (default 1) fail with TEXT, or
                          with --null answer nothing without an error
  fail --clear            disarm every operation
  fail --list             list the operations that can be armed
  journal [--json]        print the latest host calls (at most 10,000), oldest
                          first: operation, arguments and outcome (passed,
                          refused, failed or nothing)
  journal --clear         empty the journal
  help                    print this text
)";

// A command line hyrasim cannot follow; reported with a hint at the usage.
struct UsageError {
  std::string text;
};

using Args = std::vector<std::string>;

void Expect(bool condition, const std::string& text) {
  if (!condition) throw UsageError{text};
}

int64_t ParseCount(const std::string& option, const std::string& text) {
  int64_t value = 0;
  const char* end = text.data() + text.size();
  const auto [stop, error] = std::from_chars(text.data(), end, value);
  Expect(!text.empty() && error == std::errc() && stop == end,
         option + " needs a whole number, not \"" + text + "\"");
  return value;
}

int Init(const Args& args) {
  if (args.size() == 1 && args[0] == "--demo") {
    HyraSim::InitDemo();
    std::cout << "The world at " << HyraSim::DatabasePath() << " is now the demo world.\n";
    return 0;
  }
  Expect(args.size() == 2 && args[0] == "--scenario", "init takes --demo or --scenario FILE");
  HyraSim::InitScenario(HyraSimTool::ReadScenarioFile(args[1]));
  std::cout << "The world at " << HyraSim::DatabasePath() << " now holds " << args[1] << ".\n";
  return 0;
}

int Show(const Args& args) {
  const bool json = args.size() == 1 && args[0] == "--json";
  Expect(args.empty() || json, "show takes only --json");
  const std::string scenario = HyraSim::ExportScenario();
  if (json) {
    std::cout << scenario;
  } else {
    HyraSim::PrintWorld(std::cout, HyraSim::DatabasePath(), HyraSim::ReadScenario(scenario),
                        HyraSim::ArmedFailures());
  }
  return 0;
}

int Daemon(const Args& args) {
  Expect(args.size() == 1 && (args[0] == "start" || args[0] == "stop"),
         "daemon takes start or stop");
  HyraSim::SetDaemonRunning(args[0] == "start");
  std::cout << (args[0] == "start" ? "Tarnd is running.\n" : "Tarnd is stopped.\n");
  return 0;
}

// "1 call passes", "3 calls pass": count calls with the verb agreeing.
std::string Calls(int64_t count, const char* singular, const char* plural) {
  return std::to_string(count) + (count == 1 ? " call " : " calls ") +
         (count == 1 ? singular : plural);
}

int Fail(const Args& args) {
  Expect(!args.empty(), "fail needs an OPERATION, --clear or --list");
  if (args[0] == "--clear" || args[0] == "--list") {
    Expect(args.size() == 1, args[0] + " takes nothing more");
    if (args[0] == "--clear") {
      HyraSim::ClearFailures();
      std::cout << "No operation is armed.\n";
    } else {
      for (const auto& name : HyraSim::ArmableOperations()) std::cout << name << "\n";
    }
    return 0;
  }
  Expect(args[0].compare(0, 2, "--") != 0, "unknown option " + args[0]);
  HyraSim::FailureSpec spec;
  for (size_t i = 1; i < args.size(); ++i) {
    const std::string& option = args[i];
    if (option == "--null") {
      spec.null = true;
      continue;
    }
    Expect(option == "--message" || option == "--after" || option == "--times",
           "unknown option " + option);
    Expect(i + 1 < args.size(), option + " needs a value");
    const std::string& value = args[++i];
    if (option == "--message") {
      spec.message = value;
    } else {
      (option == "--after" ? spec.after : spec.times) = ParseCount(option, value);
    }
  }
  HyraSim::ArmFailure(args[0], spec);
  std::cout << args[0] << " is armed: " << Calls(spec.after, "passes", "pass") << ", then "
            << (spec.null ? Calls(spec.times, "answers nothing", "answer nothing")
                          : Calls(spec.times, "fails", "fail"))
            << ".\n";
  return 0;
}

int Journal(const Args& args) {
  const bool json = args.size() == 1 && args[0] == "--json";
  const bool clear = args.size() == 1 && args[0] == "--clear";
  Expect(args.empty() || json || clear, "journal takes only --json or --clear");
  if (clear) {
    HyraSim::ClearJournal();
    std::cout << "The journal is empty.\n";
    return 0;
  }
  HyraSim::PrintJournal(std::cout, HyraSim::ReadJournal(), json);
  return 0;
}

int Run(const std::string& command, const Args& args) {
  if (command == "init") return Init(args);
  if (command == "show") return Show(args);
  if (command == "daemon") return Daemon(args);
  if (command == "fail") return Fail(args);
  if (command == "journal") return Journal(args);
  if (command == "help" || command == "--help" || command == "-h") {
    std::cout << kUsage;
    return 0;
  }
  throw UsageError{"unknown command " + command};
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 2) {
    std::cerr << kUsage;
    return 2;
  }
  try {
    return Run(argv[1], Args(argv + 2, argv + argc));
  } catch (const UsageError& e) {
    std::cerr << "hyrasim: " << e.text << "\nRun hyrasim help for the usage.\n";
    return 2;
  } catch (const std::exception& e) {
    std::cerr << "hyrasim: " << e.what() << "\n";
    return 1;
  }
}

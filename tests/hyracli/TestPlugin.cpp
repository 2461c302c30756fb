// The plug-ins of the end-to-end tests, one source built in four variants:
//   1  creates "storage sample" with "hello"
//   2  adds "bye" to "storage sample", so it needs variant 1 loaded first
//   3  hangs "leftover" into the tree, then fails as when tarnLib cannot open
//   4  has no entry at all
#include <boost/pointer_cast.hpp>
#include <cstdlib>
#include <fstream>

#include "Fendle/AutoCli.h"
#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"

namespace {

class Greeting : public Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<Greeting> New(const std::string& word) {
    return boost::shared_ptr<Greeting>(new Greeting(word));
  }
  // Noted in $HYRACLI_TEST_TRACE; this runs only while the library is loaded.
  ~Greeting() override {
    const char* path = std::getenv("HYRACLI_TEST_TRACE");
    if (path != nullptr) std::ofstream(path, std::ios::app) << word_ << " destroyed\n";
  }

 protected:
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>&,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override {
    output->SetResult(Fendle::MetaObj::MetaString::New(word_));
    output->Finish();
  }

 private:
  explicit Greeting(const std::string& word) : word_(word) { SetDescription("Say " + word + "."); }
  std::string word_;
};

}  // namespace

#if VARIANT != 4
extern "C" void AutoCli_RegisterNamespaces(boost::shared_ptr<Fendle::AutoCli::Namespace>& root) {
  auto storage = root->GetNamespaceNode("storage");
#if VARIANT == 1
  auto sample = Fendle::AutoCli::Namespace::New();
  sample->SetDescription("Sample commands.");
  sample->RegisterNamespaceNode(Greeting::New("Hello"), "hello");
  storage->RegisterNamespaceNode(sample, "sample");
#elif VARIANT == 2
  auto sample = storage->GetNamespaceNode("sample");
  if (!sample) throw HostCtl::Lib::HostCtlException("no 'sample' namespace", {});
  sample->RegisterNamespaceNode(Greeting::New("Bye"), "bye");
#else
  storage->RegisterNamespaceNode(Greeting::New("Leftover"), "leftover");
  throw OskCtl::Lib::OskCtlException("Unable to initialize tarnLib",
                                     "internal/StorageContainerLoad", 42, {});
#endif
}
#endif

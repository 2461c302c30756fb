// A plug-in whose entry fails after it has already hung a command of its own
// into the tree, as a plug-in does when the daemon library cannot be opened.
#include <cstdlib>
#include <fstream>

#include "Fendle/AutoCli.h"
#include "HostCtl/Lib.h"
#include "OskCtl/Lib.h"

namespace {

class Leftover : public Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<Leftover> New() { return boost::shared_ptr<Leftover>(new Leftover()); }
  ~Leftover() override {
    const char* path = std::getenv("HYRACLI_TEST_TRACE");
    if (path != nullptr) std::ofstream(path, std::ios::app) << "leftover destroyed\n";
  }

 private:
  Leftover() = default;
};

}  // namespace

extern "C" void AutoCli_RegisterNamespaces(boost::shared_ptr<Fendle::AutoCli::Namespace>& root) {
  root->GetNamespaceNode("storage")->RegisterNamespaceNode(Leftover::New(), "leftover");
  throw OskCtl::Lib::OskCtlException("Unable to initialize tarnLib",
                                     "internal/StorageContainerLoad", 42,
                                     HostCtl::Lib::KelmMessage());
}

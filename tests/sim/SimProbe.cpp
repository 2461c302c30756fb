// Uses the stand-in host libraries from a process of its own, so that tests
// see what several processes do to one world. A host failure is printed as
// "error: TEXT" with exit status 3.
#include <iostream>
#include <memory>
#include <string>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"

int main(int argc, char** argv) {
  const std::string command = argc > 1 ? argv[1] : "";
  try {
    OskCtl::Storage::StorageInfoImpl host;
    if (command == "add-providers" && argc == 4) {
      const int count = std::stoi(argv[3]);
      for (int i = 0; i < count; ++i) {
        HostCtl::Storage::VendorProviderInfo provider;
        provider.name = std::string(argv[2]) + "-" + std::to_string(i);
        provider.url = "https://" + provider.name + ".example.test/kiro";
        host.UpdateTarnVendorProvider({provider});
      }
      return 0;
    }
    if (command == "mount" && argc == 4) {
      std::string id = argv[3];
      const std::unique_ptr<HostCtl::Storage::TarnFileSystem> mounted(
          host.AddTarnFileSystem(argv[2], id, {}, true));
      std::cout << "mounted " << (mounted ? mounted->GetContainerName() : "nothing") << "\n";
      return 0;
    }
    if (command == "vp-exists" && argc == 3) {
      std::cout << (host.TarnVpExists(argv[2]) ? "true" : "false") << "\n";
      return 0;
    }
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::cout << "error: " << e.GetMessage() << "\n";
    return 3;
  }
  std::cerr << "usage: sim_probe add-providers PREFIX COUNT | mount NAME ID | vp-exists NAME\n";
  return 2;
}

// `kiroprovider injectfault`: makes the daemon treat a Kiro provider's
// connection as being in a given state. Relies on the library being held open
// by other commands of the same tree.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class VendorProviderInjectFault : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<VendorProviderInjectFault> New();

 protected:
  VendorProviderInjectFault();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

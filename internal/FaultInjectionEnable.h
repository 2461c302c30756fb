// `faultInjection enable`: switches the daemon's fault injection on or off.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class FaultInjectionEnable : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<FaultInjectionEnable> New();

 protected:
  FaultInjectionEnable();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

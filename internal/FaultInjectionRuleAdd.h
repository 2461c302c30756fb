// `faultInjection rule add`: adds a fault injection rule to the daemon.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class FaultInjectionRuleAdd : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<FaultInjectionRuleAdd> New();

 protected:
  FaultInjectionRuleAdd();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

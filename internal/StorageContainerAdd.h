// `storagecontainer add`: mounts one storage container given by hand.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class StorageContainerAdd : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<StorageContainerAdd> New();

 protected:
  StorageContainerAdd();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

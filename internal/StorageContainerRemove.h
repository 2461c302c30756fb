// `storagecontainer remove`: unmounts one storage container by its id. Holds the
// daemon client library open for its whole life.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class StorageContainerRemove : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<StorageContainerRemove> New();
  // Releases the daemon client library opened by the constructor.
  ~StorageContainerRemove() override;

 protected:
  // Opens the daemon client library as its last step; throws
  // OskCtl::Lib::OskCtlException when it cannot.
  StorageContainerRemove();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

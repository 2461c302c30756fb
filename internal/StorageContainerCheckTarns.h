// `storagecontainer checktarns`: tells whether the host can reach tarns of a
// mounted container. Holds the daemon client library open for its whole life.
#pragma once

#include <boost/shared_ptr.hpp>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"
#include "HostCtl/Storage.h"

namespace HalvikCli {
namespace TarnNamespace {

class StorageContainerCheckTarns : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<StorageContainerCheckTarns> New();
  // Releases the daemon client library opened by the constructor.
  ~StorageContainerCheckTarns() override;

  // The prototype of one result row.
  virtual boost::shared_ptr<Fendle::MetaObj::MetaStruct> GetOutputStructure();

  // One row per state answered, with the id at the same position; never
  // reads past the end of either list.
  boost::shared_ptr<Fendle::MetaObj::MetaList> GetAccessibilityList(
      const std::vector<std::string>& tarnIds,
      const std::vector<HostCtl::Storage::TarnAccessibilityType>& states);

 protected:
  // Opens the daemon client library as its last step; throws
  // OskCtl::Lib::OskCtlException when it cannot.
  StorageContainerCheckTarns();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

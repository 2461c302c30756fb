// `storagecontainer load`: mounts every storage container the providers export
// that the host has not mounted yet. Holds the daemon client library open for
// its whole life.
#pragma once

#include <boost/shared_ptr.hpp>
#include <cstdint>
#include <string>
#include <vector>

#include "Fendle/AutoCli.h"
#include "TarnLib/TarnLib.h"

namespace HalvikCli {
namespace TarnNamespace {

// One storage array of one exported container.
struct SAInfo {
  std::string arrayId;
  std::string arrayName;
  std::string vendorId;
  std::string modelId;
  std::vector<std::string> peInfo;  // one description line per protocol endpoint
};

// The ids of a container's arrays, in the daemon's order.
std::vector<std::string> ReadArrayIds(const StorageContainerRecord& container);

// A container's arrays, each with the description line of every protocol
// endpoint, in the daemon's order.
std::vector<SAInfo> ReadStorageArrays(const StorageContainerRecord& container);

// The description line of the protocol endpoint at index within its array.
std::string DescribeProtocolEndpoint(int32_t index, const ProtocolEndpointRecord& endpoint);

class StorageContainerLoad : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<StorageContainerLoad> New();
  // Releases the daemon client library opened by the constructor.
  ~StorageContainerLoad() override;

  // The prototype of one result row.
  virtual boost::shared_ptr<Fendle::MetaObj::MetaStruct> GetOutputStructure();

  // The prototype of one array element of a row.
  boost::shared_ptr<Fendle::MetaObj::MetaStruct> GetStorageArrayStructure();
  // One "Array" structure per record, in order.
  boost::shared_ptr<Fendle::MetaObj::MetaList> GetStorageArrayList(
      const std::vector<SAInfo>& arrays);

 protected:
  // Opens the daemon client library as its last step; throws
  // OskCtl::Lib::OskCtlException when it cannot.
  StorageContainerLoad();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

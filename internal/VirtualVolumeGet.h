// `virtualvolume get`: sizes, storage profile and block size of one volume.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class VirtualVolumeGet : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<VirtualVolumeGet> New();

  // The prototype of the result; also the starting value of each result.
  boost::shared_ptr<Fendle::MetaObj::MetaStruct> GetOutputStructure();

 protected:
  VirtualVolumeGet();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

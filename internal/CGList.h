// Lists consistency groups. Not hung into the tree.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class CGList : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<CGList> New();

  // The prototype of one result row.
  virtual boost::shared_ptr<Fendle::MetaObj::MetaStruct> GetOutputStructure();

 protected:
  CGList();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

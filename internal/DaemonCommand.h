// `daemon set`: the daemon's debug switchboard. Holds the daemon client library
// open for its whole life.
#pragma once

#include <boost/shared_ptr.hpp>
#include <cstdint>
#include <string>

#include "Fendle/AutoCli.h"

namespace HalvikCli {
namespace TarnNamespace {

class DaemonCommand : public virtual Fendle::AutoCli::Command {
 public:
  static boost::shared_ptr<DaemonCommand> New();
  // Releases the daemon client library opened by the constructor.
  ~DaemonCommand() override;

  // The daemon's number for a log-level word (any case); 4 for an unknown word.
  int32_t GetLogLevelInt(const std::string& word) const;

 protected:
  // Opens the daemon client library as its last step; throws
  // OskCtl::Lib::OskCtlException when it cannot.
  DaemonCommand();

  boost::shared_ptr<Fendle::CallSpec::InputSpec> GetInputSpecInternal() override;
  boost::shared_ptr<Fendle::CallSpec::OutputSpec> GetOutputSpecInternal() override;
  // One of three actions, chosen by the parameters given: a protocol-endpoint
  // APD notification, the space-efficiency switch, or the debug settings.
  void ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) override;
};

}  // namespace TarnNamespace
}  // namespace HalvikCli

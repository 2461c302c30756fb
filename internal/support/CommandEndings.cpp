#include "support/CommandEndings.h"

#include <sstream>

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaBool;

void EndWithResult(const OutputPtr& output,
                   const boost::shared_ptr<Fendle::MetaObj::MetaObject>& result) {
  output->SetResult(result);
  output->Finish();
}

void EndWithText(const OutputPtr& output, const std::string& text) {
  EndWithResult(output, Fendle::MetaObj::MetaString::New(text));
}

void EndWithTrue(const OutputPtr& output) { EndWithResult(output, MetaBool::New(true)); }

void EndWithError(const OutputPtr& output, const std::string& text) { output->SetError(text); }

void EndWithErrorAndFinish(const OutputPtr& output, const std::string& text) {
  output->SetError(text);
  output->Finish();
}

void EndWithErrorAndFalse(const OutputPtr& output, const std::string& text) {
  output->SetError(text);
  output->SetResult(MetaBool::New(false));
}

void EndWithErrorFalseAndFinish(const OutputPtr& output, const std::string& text) {
  EndWithErrorAndFalse(output, text);
  output->Finish();
}

void EndWithDaemonStatus(const OutputPtr& output, TarnLib_Status status,
                         const std::string& failurePrefix) {
  if (status == TARNLIB_OK) {
    EndWithTrue(output);
    return;
  }
  std::ostringstream text;
  text << failurePrefix << TarnLib_Err2String(status) << std::endl;
  EndWithError(output, text.str());
}

}  // namespace TarnNamespace
}  // namespace HalvikCli

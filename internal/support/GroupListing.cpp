#include "support/GroupListing.h"

#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaType;

void ExecuteGroupListing(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                         const boost::shared_ptr<Fendle::MetaObj::MetaStruct>& row) {
  // Read but not used yet: no library answers group requests.
  input.GetStringList(kCgId);
  input.GetString(kVpName);
  const boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct, row);
  const TryInvocationBracket bracket;
  if (!bracket.IsOpen()) {
    EndWithError(output, kFailedToInitializeTarnLib);
    return;
  }
  EndWithResult(output, rows);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli

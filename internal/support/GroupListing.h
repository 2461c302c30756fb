// What the consistency-group list and sync commands share: neither asks any
// library about groups yet; both answer an empty list of rows once the daemon
// client library opens.
#pragma once

#include <boost/shared_ptr.hpp>

#include "Fendle/CallSpec.h"
#include "Fendle/MetaObj.h"
#include "support/CommandEndings.h"

namespace HalvikCli {
namespace TarnNamespace {

// Reported by a consistency-group command whose execution cannot open the
// daemon client library.
inline constexpr char kFailedToInitializeTarnLib[] = "Failed to initialize TarnLib";

// One invocation: reads cgid and vp-name, then answers an empty list whose
// element prototype is row. The opening is released before it returns.
void ExecuteGroupListing(const Fendle::CallSpec::Input& input, const OutputPtr& output,
                         const boost::shared_ptr<Fendle::MetaObj::MetaStruct>& row);

}  // namespace TarnNamespace
}  // namespace HalvikCli

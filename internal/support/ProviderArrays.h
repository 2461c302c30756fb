// The records the Kiro provider commands hand to the host, the rule by which
// `kiroprovider add` and `set` read a provider's arrays, and how `set` and
// `injectfault` find the provider the host keeps.
#pragma once

#include <string>
#include <vector>

#include "Fendle/CallSpec.h"
#include "HostCtl/Storage.h"
#include "OskCtl/Storage.h"
#include "support/CommandEndings.h"

namespace HalvikCli {
namespace TarnNamespace {

inline constexpr char kArrayListMismatch[] =
    "Missing one of the  parameter arrayIdor priority or isActive for an Array ";

// Reads arrayid, priority and isactive and pairs them by position into arrays.
// The three lists must be equally long and every priority must fit a signed
// 32-bit integer; otherwise answers false with the error text in error and
// leaves arrays empty. Nothing else is checked.
bool ReadProviderArrays(const Fendle::CallSpec::Input& input,
                        std::vector<HostCtl::Storage::RelatedStorageArrayInfo>& arrays,
                        std::string& error);

// The host's record of a provider; its third text is left empty.
HostCtl::Storage::VendorProviderInfo MakeProviderRecord(
    const std::string& name, const std::string& url,
    const std::vector<HostCtl::Storage::RelatedStorageArrayInfo>& arrays);

// The URL of the provider the host keeps under name, from
// GetTarnVendorProviders; false when the host answers no provider. Host
// failures propagate.
bool LookUpStoredProviderUrl(OskCtl::Storage::StorageInfoImpl& storageInfo, const std::string& name,
                             std::string& url);

// Ends with the error "<prefix><name> does not exist" and a line feed.
void EndWithUnknownProvider(const OutputPtr& output, const char* prefix, const std::string& name);

}  // namespace TarnNamespace
}  // namespace HalvikCli

#include "StorageContainerCheckTarns.h"

#include <algorithm>
#include <cstdint>
#include <memory>
#include <string>

#include "HostCtl/Lib.h"
#include "OskCtl/Storage.h"
#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/DaemonRecords.h"
#include "support/ParameterNames.h"
#include "support/TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;
using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaStruct;
using Fendle::MetaObj::MetaType;
using HostCtl::Storage::TarnAccessibilityType;

namespace {

constexpr char kDescription[] = "Check availability of given Tarns in a StorageContainer";
constexpr char kSource[] = "internal/StorageContainerCheckTarns";
constexpr int kInitLine = 40;

constexpr char kRowStructure[] = "TarnsAreAccessible";
constexpr char kTarnIdField[] = "TarnId";
constexpr char kStatusField[] = "Status";
const FieldNames kRowFields = {kTarnIdField, kStatusField};
constexpr char kBadPath[] = "Bad datastore path";
constexpr char kQueryFailedPrefix[] = "Unable to list the config-tarns of container ";
// Asks the daemon for every config-tarn at once.
constexpr int32_t kAllEntries = 2147483647;

// Appends the ids of the container's config-tarns to ids, in the daemon's
// order, and answers the query's status. The result is given back whether the
// query succeeded or not.
TarnLib_Status QueryConfigTarnIds(const std::string& containerId, std::vector<std::string>& ids) {
  QueryResult* handedOut = nullptr;
  const TarnLib_Status status =
      TarnLib_QueryAllConfigTarns(containerId.c_str(), kAllEntries, 0, &handedOut, 0);
  const QueryResultOwner result(handedOut);
  if (status != TARNLIB_OK || result == nullptr || result->entries == nullptr) return status;
  for (int32_t i = 0; i < result->entryCount; ++i) {
    if (const ConfigTarnEntry* entry = result->entries[i]) ids.push_back(TextOf(entry->tarnId));
  }
  return status;
}

// "1 state", "2 states".
std::string Counted(size_t count, const char* singular, const char* plural) {
  return std::to_string(count) + " " + (count == 1 ? singular : plural);
}

// The status word of a state, or null for a state without one.
const char* StatusWord(TarnAccessibilityType state) {
  switch (state) {
    case HostCtl::Storage::TARN_NON_EXISTENT:
      return "non-existent";
    case HostCtl::Storage::TARN_UNCONFIRMED:
      return "unconfirmed";
    case HostCtl::Storage::TARN_INACCESSIBLE:
      return "inaccessible";
    case HostCtl::Storage::TARN_ACCESSIBLE:
      return "accessible";
  }
  return nullptr;
}

}  // namespace

boost::shared_ptr<StorageContainerCheckTarns> StorageContainerCheckTarns::New() {
  return boost::shared_ptr<StorageContainerCheckTarns>(new StorageContainerCheckTarns());
}

StorageContainerCheckTarns::StorageContainerCheckTarns() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kTableFormatter);
  SetDefaultOutputParameter(FieldsHintKey(kRowStructure), JoinFieldNames(kRowFields));
  OpenTarnLib(kSource, kInitLine);
}

StorageContainerCheckTarns::~StorageContainerCheckTarns() { TarnLib_Exit(); }

boost::shared_ptr<Fendle::CallSpec::InputSpec> StorageContainerCheckTarns::GetInputSpecInternal() {
  return DeclareParameters({
      {kPath, "p", ParameterType::String, kRequired, "Tarn datastore path"},
      {kTarn, "v", ParameterType::StringList, kOptional, "Tarn Uuid"},
  });
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec>
StorageContainerCheckTarns::GetOutputSpecInternal() {
  return DeclareResult(MetaList::New(MetaType::Struct, GetOutputStructure()));
}

boost::shared_ptr<Fendle::MetaObj::MetaStruct> StorageContainerCheckTarns::GetOutputStructure() {
  return NewTextStruct(kRowStructure, kRowFields);
}

boost::shared_ptr<MetaList> StorageContainerCheckTarns::GetAccessibilityList(
    const std::vector<std::string>& tarnIds, const std::vector<TarnAccessibilityType>& states) {
  const boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct, GetOutputStructure());
  const size_t count = std::min(tarnIds.size(), states.size());
  for (size_t i = 0; i < count; ++i) {
    const boost::shared_ptr<MetaStruct> row = GetOutputStructure();
    row->SetField(kTarnIdField, tarnIds[i]);
    // A state without a word leaves the status empty.
    if (const char* word = StatusWord(states[i])) row->SetField(kStatusField, word);
    rows->Append(row);
  }
  return rows;
}

void StorageContainerCheckTarns::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  OskCtl::Storage::StorageInfoImpl storageInfo;
  const std::string path = input->GetString(kPath);
  std::vector<std::string> tarnIds = input->GetStringList(kTarn);
  try {
    // Belongs to storageInfo, which outlives every use of it here.
    HostCtl::Storage::TarnFileSystem* container = storageInfo.GetTarnFileSystemByPath(path);
    if (container == nullptr) {
      EndWithError(output, kBadPath);
      return;
    }
    if (tarnIds.empty()) {
      // A failed query is not an empty container: say so rather than answer no rows.
      const std::string containerId = container->GetContainerIdText();
      const TarnLib_Status status = QueryConfigTarnIds(containerId, tarnIds);
      if (status != TARNLIB_OK) {
        EndWithError(output,
                     kQueryFailedPrefix + containerId + ": " + TextOf(TarnLib_Err2String(status)));
        return;
      }
    }
    const std::vector<TarnAccessibilityType> states = container->CheckTarnAccessibility(tarnIds);
    // Rows pair ids and states by position; a short or long answer would drop
    // tarns or invent them.
    if (states.size() != tarnIds.size()) {
      EndWithError(output,
                   "The host answered " +
                       Counted(states.size(), "accessibility state", "accessibility states") +
                       " for " + Counted(tarnIds.size(), "tarn", "tarns"));
      return;
    }
    EndWithResult(output, GetAccessibilityList(tarnIds, states));
  } catch (const HostCtl::Lib::HostCtlException& e) {
    EndWithError(output, e.GetMessage(false));
  }
}

}  // namespace TarnNamespace
}  // namespace HalvikCli

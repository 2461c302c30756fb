#include "VirtualVolumeMetaDataList.h"

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/DaemonRecords.h"
#include "support/SharedParameters.h"
#include "support/TarnLibBracket.h"
#include "support/VirtualVolumeQuery.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaStruct;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "List Virtual Volume MetaData.";
constexpr char kSource[] = "internal/VirtualVolumeMetaDataList";
constexpr int kInitLine = 88;

constexpr char kRowStructure[] = "TarnMetaData";
constexpr char kKey[] = "key";
constexpr char kValue[] = "value";
// Also when the query succeeds without handing out a record.
constexpr char kMetadataFailed[] = "Failed to get the metadata for Tarn.";

}  // namespace

boost::shared_ptr<VirtualVolumeMetaDataList> VirtualVolumeMetaDataList::New() {
  return boost::shared_ptr<VirtualVolumeMetaDataList>(new VirtualVolumeMetaDataList());
}

VirtualVolumeMetaDataList::VirtualVolumeMetaDataList() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kTableFormatter);
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> VirtualVolumeMetaDataList::GetInputSpecInternal() {
  return DeclareVirtualVolumeParameters();
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VirtualVolumeMetaDataList::GetOutputSpecInternal() {
  return DeclareResult(MetaList::New(MetaType::Struct, GetOutputStructure()));
}

boost::shared_ptr<Fendle::MetaObj::MetaStruct> VirtualVolumeMetaDataList::GetOutputStructure() {
  return NewTextStruct(kRowStructure, {kKey, kValue});
}

void VirtualVolumeMetaDataList::ExecuteInternal(
    const boost::shared_ptr<Fendle::CallSpec::Input>& input,
    const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, kInitLine);
  VirtualVolumeAddress volume;
  if (!ReadVirtualVolumeAddress(*input, output, volume)) {
    return;
  }

  TarnMetadata* record = nullptr;
  const TarnLib_Status status =
      TarnLib_GetTarnMetadata(volume.containerId, volume.uuid.c_str(), &record);
  const TarnMetadataOwner metadata(record);
  if (status != TARNLIB_OK || !metadata) {
    EndWithError(output, kMetadataFailed);
    return;
  }

  // One row per entry, in the daemon's order.
  boost::shared_ptr<MetaList> rows = MetaList::New(MetaType::Struct, GetOutputStructure());
  for (const TarnMetadataEntry* entry = metadata->first; entry != nullptr; entry = entry->next) {
    boost::shared_ptr<MetaStruct> row = GetOutputStructure();
    SetTextIfPresent(*row, kKey, entry->key);
    SetTextIfPresent(*row, kValue, entry->value);
    rows->Append(row);
  }
  // The record is released by its owner after Finish.
  EndWithResult(output, rows);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli

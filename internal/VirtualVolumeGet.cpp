#include "VirtualVolumeGet.h"

#include <cstdint>
#include <cstring>

#include "TarnLib/TarnLib.h"
#include "support/CommandEndings.h"
#include "support/CommandSpecs.h"
#include "support/DaemonRecords.h"
#include "support/SharedParameters.h"
#include "support/TarnLibBracket.h"
#include "support/VirtualVolumeQuery.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::MetaObj::MetaBool;
using Fendle::MetaObj::MetaInt;
using Fendle::MetaObj::MetaString;
using Fendle::MetaObj::MetaStruct;

namespace {

constexpr char kDescription[] = "Get information about a Virtual Volume.";
constexpr char kSource[] = "internal/VirtualVolumeGet";
constexpr int kInitLine = 102;

constexpr char kInfoStructure[] = "TarnInfoInternal";
constexpr char kTarnUuid[] = "Tarn UUID";
constexpr char kContainerIdField[] = "Container Id";
constexpr char kLogicalSize[] = "Logical Size";
constexpr char kCommittedSize[] = "Committed Size";
constexpr char kUnsharedSize[] = "Unshared Size";
constexpr char kUnsharedSizeValid[] = "Unshared Size Valid";
constexpr char kStorageProfile[] = "Storage Profile";
constexpr char kBlockSize[] = "Block Size";
constexpr char kMegabytes[] = "MB";

// Each failed question ends the command with its own text. A question that
// succeeds without handing out a record has failed as well.
constexpr char kSpaceStatsFailed[] = "Failed to get space stats for Tarn.";
constexpr char kStorageProfileFailed[] = "Failed to get the storage profile for Tarn.";
constexpr char kBlockSizeFailed[] = "Failed to get block size for Tarn.";

}  // namespace

boost::shared_ptr<VirtualVolumeGet> VirtualVolumeGet::New() {
  return boost::shared_ptr<VirtualVolumeGet>(new VirtualVolumeGet());
}

VirtualVolumeGet::VirtualVolumeGet() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kSimpleFormatter);
  for (const char* sized : {kLogicalSize, kCommittedSize, kUnsharedSize}) {
    SetDefaultOutputParameter(UnitsHintKey(kInfoStructure, sized), kMegabytes);
  }
  SetDefaultOutputParameter(
      FieldsHintKey(kInfoStructure),
      JoinFieldNames({kContainerIdField, kTarnUuid, kLogicalSize, kCommittedSize,
                      kUnsharedSizeValid, kUnsharedSize, kStorageProfile, kBlockSize}));
}

boost::shared_ptr<Fendle::CallSpec::InputSpec> VirtualVolumeGet::GetInputSpecInternal() {
  return DeclareVirtualVolumeParameters();
}

boost::shared_ptr<Fendle::CallSpec::OutputSpec> VirtualVolumeGet::GetOutputSpecInternal() {
  return DeclareResult(GetOutputStructure());
}

boost::shared_ptr<MetaStruct> VirtualVolumeGet::GetOutputStructure() {
  boost::shared_ptr<MetaStruct> info = MetaStruct::New(kInfoStructure);
  info->SetField(kTarnUuid, MetaString::New());
  info->SetField(kContainerIdField, MetaString::New());
  info->SetField(kLogicalSize, MetaInt::New());
  info->SetField(kCommittedSize, MetaInt::New());
  info->SetField(kUnsharedSize, MetaInt::New());
  info->SetField(kUnsharedSizeValid, MetaBool::New());
  info->SetField(kStorageProfile, MetaString::New());
  info->SetField(kBlockSize, MetaInt::New());
  return info;
}

void VirtualVolumeGet::ExecuteInternal(const boost::shared_ptr<Fendle::CallSpec::Input>& input,
                                       const boost::shared_ptr<Fendle::CallSpec::Output>& output) {
  InvocationBracket bracket(kSource, kInitLine);
  VirtualVolumeAddress volume;
  if (!ReadVirtualVolumeAddress(*input, output, volume)) {
    return;
  }
  const char* uuid = volume.uuid.c_str();

  boost::shared_ptr<MetaStruct> info = GetOutputStructure();
  info->SetField(kTarnUuid, volume.uuid);
  info->SetField(kContainerIdField, volume.containerId);

  // Each record is given back as soon as it has been read, before the next question.
  {
    TarnSpaceStatsInfo* statsRecord = nullptr;
    const TarnLib_Status status = TarnLib_SpaceStatsForTarn(volume.containerId, uuid, &statsRecord);
    const TarnSpaceStatsOwner stats(statsRecord);
    if (status != TARNLIB_OK || !stats) {
      EndWithError(output, kSpaceStatsFailed);
      return;
    }
    info->SetField(kLogicalSize, stats->logicalSizeMB);
    info->SetField(kCommittedSize, stats->committedSizeMB);
    if (stats->unsharedSizeValid) {
      info->SetField(kUnsharedSize, stats->unsharedSizeMB);
      info->SetField(kUnsharedSizeValid, MetaBool::New(true));
    } else {
      info->SetField(kUnsharedSizeValid, MetaBool::New(false));
    }
  }
  {
    TarnInfo* infoRecord = nullptr;
    const TarnLib_Status status = TarnLib_GetTarnInfo(volume.containerId, uuid, &infoRecord);
    const TarnInfoOwner tarnInfo(infoRecord);
    if (status != TARNLIB_OK || !tarnInfo) {
      EndWithError(output, kStorageProfileFailed);
      return;
    }
    SetTextIfPresent(*info, kStorageProfile, tarnInfo->storageProfile);
  }
  {
    void* chunksBlock = nullptr;
    const TarnLib_Status status =
        TarnLib_UnsharedChunksTarn(volume.containerId, uuid, 0, 0, 0, 0, 0, &chunksBlock);
    const UnsharedChunksOwner chunks(chunksBlock);
    if (status != TARNLIB_OK || !chunks) {
      EndWithError(output, kBlockSizeFailed);
      return;
    }
    // The block starts with the block size.
    int64_t blockSize = 0;
    std::memcpy(&blockSize, chunks.get(), sizeof blockSize);
    info->SetField(kBlockSize, blockSize);
  }

  EndWithResult(output, info);
}

}  // namespace TarnNamespace
}  // namespace HalvikCli

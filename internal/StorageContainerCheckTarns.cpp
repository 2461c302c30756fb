#include "StorageContainerCheckTarns.h"

#include "CommandSpecs.h"
#include "ParameterNames.h"
#include "TarnLib/TarnLib.h"
#include "TarnLibBracket.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::ParameterType;
using Fendle::MetaObj::MetaList;
using Fendle::MetaObj::MetaType;

namespace {

constexpr char kDescription[] = "Check availability of given Tarns in a StorageContainer";
constexpr char kSource[] = "internal/StorageContainerCheckTarns";
constexpr int kInitLine = 40;

}  // namespace

boost::shared_ptr<StorageContainerCheckTarns> StorageContainerCheckTarns::New() {
  return boost::shared_ptr<StorageContainerCheckTarns>(new StorageContainerCheckTarns());
}

StorageContainerCheckTarns::StorageContainerCheckTarns() {
  SetDescription(kDescription);
  SetMetaDataField(kTypeField, kOperationKind);
  SetDefaultOutputFormatter(kTableFormatter);
  SetDefaultOutputParameter("fields:TarnsAreAccessible", "TarnId,Status");
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
  return NewTextStruct("TarnsAreAccessible", {"TarnId", "Status"});
}

}  // namespace TarnNamespace
}  // namespace HalvikCli

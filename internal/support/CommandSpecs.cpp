#include "support/CommandSpecs.h"

namespace HalvikCli {
namespace TarnNamespace {

using Fendle::CallSpec::InputSpec;
using Fendle::CallSpec::OutputSpec;
using Fendle::CallSpec::ParameterSpec;

boost::shared_ptr<InputSpec> DeclareParameters(std::initializer_list<ParameterRow> rows) {
  boost::shared_ptr<InputSpec> spec = InputSpec::New();
  for (const ParameterRow& row : rows) {
    boost::shared_ptr<ParameterSpec> parameter = ParameterSpec::New(row.name, row.type);
    if (row.alias != kNoAlias) {
      parameter->SetAlias(row.alias);
    }
    parameter->SetHelp(row.help);
    parameter->SetRequired(row.required);
    spec->AddParameter(parameter);
  }
  return spec;
}

boost::shared_ptr<OutputSpec> DeclareResult(
    const boost::shared_ptr<Fendle::MetaObj::MetaObject>& prototype) {
  boost::shared_ptr<OutputSpec> spec = OutputSpec::New();
  spec->SetResultType(prototype);
  return spec;
}

boost::shared_ptr<Fendle::MetaObj::MetaStruct> NewTextStruct(const char* structureName,
                                                             const FieldNames& fields) {
  boost::shared_ptr<Fendle::MetaObj::MetaStruct> row =
      Fendle::MetaObj::MetaStruct::New(structureName);
  for (const char* field : fields) {
    row->SetField(field, Fendle::MetaObj::MetaString::New());
  }
  return row;
}

std::string FieldsHintKey(const char* structure) { return std::string("fields:") + structure; }

std::string HeaderHintKey(const char* structure) { return std::string("header:") + structure; }

std::string UnitsHintKey(const char* structure, const char* field) {
  return std::string("units:") + structure + "." + field;
}

std::string JoinFieldNames(const FieldNames& fields) {
  std::string joined;
  for (const char* field : fields) {
    if (!joined.empty()) joined += ',';
    joined += field;
  }
  return joined;
}

std::string FieldReference(const char* field) { return std::string("%") + field + "%"; }

}  // namespace TarnNamespace
}  // namespace HalvikCli

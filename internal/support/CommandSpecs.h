// Building blocks of the commands' declarations: parameters from rows, the
// result type, and row structures whose fields are all texts.
#pragma once

#include <boost/shared_ptr.hpp>
#include <string>
#include <vector>

#include "Fendle/CallSpec.h"
#include "Fendle/MetaObj.h"

namespace HalvikCli {
namespace TarnNamespace {

// The metadata field that tells the host what kind of command this is, and
// its two values.
inline constexpr char kTypeField[] = "type";
inline constexpr char kOperationKind[] = "operation";
inline constexpr char kFetcherKind[] = "fetcher";

// The host's formatter names.
inline constexpr char kSimpleFormatter[] = "simple";
inline constexpr char kTableFormatter[] = "table";

// A parameter declared without a short option.
inline constexpr const char* kNoAlias = nullptr;
inline constexpr bool kRequired = true;
inline constexpr bool kOptional = false;

// One parameter as the command's help shows it.
struct ParameterRow {
  const char* name;
  const char* alias;  // kNoAlias when the parameter has no short option
  Fendle::CallSpec::ParameterType type;
  bool required;
  const char* help;
};

// An InputSpec holding the rows in order. Each row is declared with
// ParameterSpec::New, SetAlias (only when it has an alias), SetHelp,
// SetRequired and AddParameter, in that order.
boost::shared_ptr<Fendle::CallSpec::InputSpec> DeclareParameters(
    std::initializer_list<ParameterRow> rows);

// An OutputSpec whose result type is prototype.
boost::shared_ptr<Fendle::CallSpec::OutputSpec> DeclareResult(
    const boost::shared_ptr<Fendle::MetaObj::MetaObject>& prototype);

// The field names of a structure, in the order given.
typedef std::vector<const char*> FieldNames;

// A structure named structureName with an empty text for each field, in order.
boost::shared_ptr<Fendle::MetaObj::MetaStruct> NewTextStruct(const char* structureName,
                                                             const FieldNames& fields);

// Output hints spelt from the same constants as the structures they describe,
// so that a hint cannot name a field under another spelling.
// "fields:<structure>"
std::string FieldsHintKey(const char* structure);
// "header:<structure>"
std::string HeaderHintKey(const char* structure);
// "units:<structure>.<field>"
std::string UnitsHintKey(const char* structure, const char* field);
// The names joined by commas, as "fields:" and "table-columns" take them.
std::string JoinFieldNames(const FieldNames& fields);
// "%<field>%", a field's value in a "header:" hint.
std::string FieldReference(const char* field);

}  // namespace TarnNamespace
}  // namespace HalvikCli

#include "Fendle/CallSpec.h"

#include "HostCtl/Lib.h"

namespace Fendle {
namespace CallSpec {

namespace {

template <typename T>
std::vector<T> ListOf(const std::map<std::string, std::vector<T> >& values,
                      const std::string& name) {
  auto found = values.find(name);
  return found == values.end() ? std::vector<T>() : found->second;
}

// The single value of a parameter: the last one stored, or the type's empty value.
template <typename T>
T LastOf(const std::map<std::string, std::vector<T> >& values, const std::string& name,
         const T& empty) {
  auto found = values.find(name);
  return found == values.end() || found->second.empty() ? empty : found->second.back();
}

}  // namespace

std::string ParameterTypeName(ParameterType type) {
  switch (type) {
    case ParameterType::String:
      return "string";
    case ParameterType::Int:
      return "int";
    case ParameterType::Bool:
      return "bool";
    case ParameterType::Flag:
      return "flag";
    case ParameterType::StringList:
      return "string-list";
    case ParameterType::IntList:
      return "int-list";
    case ParameterType::BoolList:
      return "bool-list";
  }
  return "unknown";
}

// ParameterSpec

ParameterSpec::ParameterSpec(const std::string& name, ParameterType type)
    : name_(name), type_(type), required_(false) {}

boost::shared_ptr<ParameterSpec> ParameterSpec::New(const std::string& name, ParameterType type) {
  return boost::shared_ptr<ParameterSpec>(new ParameterSpec(name, type));
}

ParameterSpec::~ParameterSpec() = default;

void ParameterSpec::SetAlias(const std::string& alias) { alias_ = alias; }

void ParameterSpec::SetHelp(const std::string& help) { help_ = help; }

void ParameterSpec::SetRequired(bool required) { required_ = required; }

const std::string& ParameterSpec::GetName() const { return name_; }

ParameterType ParameterSpec::GetType() const { return type_; }

const std::string& ParameterSpec::GetAlias() const { return alias_; }

const std::string& ParameterSpec::GetHelp() const { return help_; }

bool ParameterSpec::IsRequired() const { return required_; }

// InputSpec

boost::shared_ptr<InputSpec> InputSpec::New() {
  return boost::shared_ptr<InputSpec>(new InputSpec());
}

InputSpec::~InputSpec() = default;

void InputSpec::AddParameter(const boost::shared_ptr<ParameterSpec>& parameter) {
  // A second parameter of the same name or alias could never be given on the
  // command line, so the declaration is refused rather than silently shadowed.
  if (!parameter) {
    throw HostCtl::Lib::HostCtlException("Cannot add an empty parameter specification",
                                         HostCtl::Lib::KelmMessage());
  }
  if (FindParameter(parameter->GetName())) {
    throw HostCtl::Lib::HostCtlException(
        "Parameter '" + parameter->GetName() + "' is declared twice", HostCtl::Lib::KelmMessage());
  }
  if (!parameter->GetAlias().empty() && FindAlias(parameter->GetAlias())) {
    throw HostCtl::Lib::HostCtlException("Alias '" + parameter->GetAlias() + "' of parameter '" +
                                             parameter->GetName() + "' is already taken",
                                         HostCtl::Lib::KelmMessage());
  }
  parameters_.push_back(parameter);
}

const std::vector<boost::shared_ptr<ParameterSpec> >& InputSpec::GetParameters() const {
  return parameters_;
}

boost::shared_ptr<ParameterSpec> InputSpec::FindParameter(const std::string& name) const {
  for (const auto& parameter : parameters_) {
    if (parameter->GetName() == name) return parameter;
  }
  return boost::shared_ptr<ParameterSpec>();
}

boost::shared_ptr<ParameterSpec> InputSpec::FindAlias(const std::string& alias) const {
  if (alias.empty()) return boost::shared_ptr<ParameterSpec>();
  for (const auto& parameter : parameters_) {
    if (parameter->GetAlias() == alias) return parameter;
  }
  return boost::shared_ptr<ParameterSpec>();
}

// OutputSpec

boost::shared_ptr<OutputSpec> OutputSpec::New() {
  return boost::shared_ptr<OutputSpec>(new OutputSpec());
}

OutputSpec::~OutputSpec() = default;

void OutputSpec::SetResultType(const boost::shared_ptr<MetaObj::MetaObject>& prototype) {
  resultType_ = prototype;
}

boost::shared_ptr<MetaObj::MetaObject> OutputSpec::GetResultType() const { return resultType_; }

// Input

boost::shared_ptr<Input> Input::New() { return boost::shared_ptr<Input>(new Input()); }

Input::~Input() = default;

std::string Input::GetString(const std::string& name) const {
  return LastOf(strings_, name, std::string());
}

std::vector<std::string> Input::GetStringList(const std::string& name) const {
  return ListOf(strings_, name);
}

int64_t Input::GetInt(const std::string& name) const {
  return LastOf(ints_, name, static_cast<int64_t>(0));
}

std::vector<int64_t> Input::GetIntList(const std::string& name) const {
  return ListOf(ints_, name);
}

bool Input::GetBool(const std::string& name) const { return LastOf(bools_, name, false); }

std::vector<bool> Input::GetBoolList(const std::string& name) const { return ListOf(bools_, name); }

bool Input::GetFlag(const std::string& name) const { return flags_.count(name) != 0; }

bool Input::IsSet(const std::string& name) const {
  return strings_.count(name) != 0 || ints_.count(name) != 0 || bools_.count(name) != 0 ||
         flags_.count(name) != 0;
}

void Input::SetString(const std::string& name, const std::string& value) {
  strings_[name] = std::vector<std::string>{value};
}

void Input::AddString(const std::string& name, const std::string& value) {
  strings_[name].push_back(value);
}

void Input::SetInt(const std::string& name, int64_t value) {
  ints_[name] = std::vector<int64_t>{value};
}

void Input::AddInt(const std::string& name, int64_t value) { ints_[name].push_back(value); }

void Input::SetBool(const std::string& name, bool value) {
  bools_[name] = std::vector<bool>{value};
}

void Input::AddBool(const std::string& name, bool value) { bools_[name].push_back(value); }

void Input::SetFlag(const std::string& name) { flags_[name] = true; }

// Output

boost::shared_ptr<Output> Output::New() { return boost::shared_ptr<Output>(new Output()); }

Output::~Output() = default;

void Output::SetError(const std::string& text) { errors_.push_back(text); }

void Output::SetResult(const boost::shared_ptr<MetaObj::MetaObject>& result) { result_ = result; }

void Output::Finish() { finished_ = true; }

bool Output::HasError() const { return !errors_.empty(); }

const std::vector<std::string>& Output::GetErrors() const { return errors_; }

boost::shared_ptr<MetaObj::MetaObject> Output::GetResult() const { return result_; }

bool Output::IsFinished() const { return finished_; }

// CallTarget

CallTarget::~CallTarget() = default;

}  // namespace CallSpec
}  // namespace Fendle

// Call specifications: what a command takes (InputSpec of ParameterSpecs), what
// it answers (OutputSpec), the parsed arguments of one invocation (Input) and
// the sink that receives its result or error (Output).
#pragma once

#include "Fendle/MetaObj.h"

#include <boost/shared_ptr.hpp>

#include <cstdint>
#include <map>
#include <string>
#include <vector>

namespace Fendle {
namespace CallSpec {

// The list types take their option repeatedly, in command-line order.
enum class ParameterType : int {
  String = 0,
  Int = 1,
  Bool = 2,  // given as true or false
  Flag = 3,  // a switch without value
  StringList = 4,
  IntList = 5,
  BoolList = 6,
};

// The lower-case name of a parameter type ("string", "int", ..., "bool-list").
std::string ParameterTypeName(ParameterType type);

class ParameterSpec {
 public:
  static boost::shared_ptr<ParameterSpec> New(const std::string& name, ParameterType type);
  virtual ~ParameterSpec();

  virtual void SetAlias(const std::string& alias);
  virtual void SetHelp(const std::string& help);
  virtual void SetRequired(bool required);

  const std::string& GetName() const;
  ParameterType GetType() const;
  // The one-letter short option, or an empty text when there is none.
  const std::string& GetAlias() const;
  const std::string& GetHelp() const;
  bool IsRequired() const;

 private:
  ParameterSpec(const std::string& name, ParameterType type);
  std::string name_;
  ParameterType type_;
  std::string alias_;
  std::string help_;
  bool required_;
};

class InputSpec {
 public:
  static boost::shared_ptr<InputSpec> New();
  virtual ~InputSpec();

  virtual void AddParameter(const boost::shared_ptr<ParameterSpec>& parameter);

  // The parameters in the order they were added.
  const std::vector<boost::shared_ptr<ParameterSpec> >& GetParameters() const;
  // The parameter with that long name, or an empty pointer.
  boost::shared_ptr<ParameterSpec> FindParameter(const std::string& name) const;
  // The parameter with that one-letter alias, or an empty pointer.
  boost::shared_ptr<ParameterSpec> FindAlias(const std::string& alias) const;

 private:
  InputSpec() = default;
  std::vector<boost::shared_ptr<ParameterSpec> > parameters_;
};

class OutputSpec {
 public:
  static boost::shared_ptr<OutputSpec> New();
  virtual ~OutputSpec();

  virtual void SetResultType(const boost::shared_ptr<MetaObj::MetaObject>& prototype);
  // The prototype result, or an empty pointer when none was set.
  boost::shared_ptr<MetaObj::MetaObject> GetResultType() const;

 private:
  OutputSpec() = default;
  boost::shared_ptr<MetaObj::MetaObject> resultType_;
};

// The parsed arguments of one invocation, keyed by long name. A getter of a
// parameter that was not given answers the empty value of its type: an empty
// text, 0, false or an empty list.
class Input {
 public:
  static boost::shared_ptr<Input> New();
  virtual ~Input();

  virtual std::string GetString(const std::string& name) const;
  virtual std::vector<std::string> GetStringList(const std::string& name) const;
  virtual int64_t GetInt(const std::string& name) const;
  virtual std::vector<int64_t> GetIntList(const std::string& name) const;
  virtual bool GetBool(const std::string& name) const;
  virtual std::vector<bool> GetBoolList(const std::string& name) const;
  // Was the switch given.
  virtual bool GetFlag(const std::string& name) const;
  // Was the parameter given at all.
  virtual bool IsSet(const std::string& name) const;

  // Filled by whoever parses the command line. A list setter appends one value.
  void SetString(const std::string& name, const std::string& value);
  void AddString(const std::string& name, const std::string& value);
  void SetInt(const std::string& name, int64_t value);
  void AddInt(const std::string& name, int64_t value);
  void SetBool(const std::string& name, bool value);
  void AddBool(const std::string& name, bool value);
  void SetFlag(const std::string& name);

 protected:
  Input() = default;

 private:
  std::map<std::string, std::vector<std::string> > strings_;
  std::map<std::string, std::vector<int64_t> > ints_;
  std::map<std::string, std::vector<bool> > bools_;
  std::map<std::string, bool> flags_;
};

// The sink of one invocation. It keeps every error text in the order reported,
// the last result handed over, and whether Finish was called.
class Output {
 public:
  static boost::shared_ptr<Output> New();
  virtual ~Output();

  virtual void SetError(const std::string& text);
  virtual void SetResult(const boost::shared_ptr<MetaObj::MetaObject>& result);
  virtual void Finish();

  bool HasError() const;
  const std::vector<std::string>& GetErrors() const;
  // The result, or an empty pointer when none was set.
  boost::shared_ptr<MetaObj::MetaObject> GetResult() const;
  bool IsFinished() const;

 protected:
  Output() = default;

 private:
  std::vector<std::string> errors_;
  boost::shared_ptr<MetaObj::MetaObject> result_;
  bool finished_ = false;
};

// The target of a call: anything that declares its input and output and can be
// executed with a parsed Input and an Output sink.
class CallTarget {
 public:
  virtual ~CallTarget();
  virtual boost::shared_ptr<InputSpec> GetInputSpec() = 0;
  virtual boost::shared_ptr<OutputSpec> GetOutputSpec() = 0;
  virtual void Execute(const boost::shared_ptr<Input>& input,
                       const boost::shared_ptr<Output>& output) = 0;
};

}  // namespace CallSpec
}  // namespace Fendle

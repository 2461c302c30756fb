// Dynamic values exchanged between commands and the host framework: the result
// a command hands to its Output sink, and the prototype result it declares in
// its OutputSpec. Every value is created by a static New function and held by
// boost::shared_ptr.
#pragma once

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace Fendle {
namespace MetaObj {

// The kind of a value; also the element kind of a list (Struct marks a list of
// structures, String a list of strings).
enum class MetaType : int { Bool = 0, Int = 1, String = 2, Struct = 3, List = 4 };

class MetaObject : public boost::enable_shared_from_this<MetaObject> {
 public:
  virtual ~MetaObject();
  virtual MetaType GetType() const = 0;
  // A deep copy of this value.
  virtual boost::shared_ptr<MetaObject> Clone() const = 0;

 protected:
  MetaObject() = default;
  MetaObject(const MetaObject&) = default;
  MetaObject& operator=(const MetaObject&) = default;
};

class MetaBool : public MetaObject {
 public:
  // An empty boolean (false, marked as never set).
  static boost::shared_ptr<MetaBool> New();
  static boost::shared_ptr<MetaBool> New(bool value);
  MetaType GetType() const override;
  boost::shared_ptr<MetaObject> Clone() const override;
  bool GetValue() const;
  // False for a value made by New() without argument.
  bool HasValue() const;

 private:
  MetaBool(bool value, bool hasValue);
  bool value_;
  bool hasValue_;
};

class MetaInt : public MetaObject {
 public:
  static boost::shared_ptr<MetaInt> New();
  static boost::shared_ptr<MetaInt> New(int64_t value);
  MetaType GetType() const override;
  boost::shared_ptr<MetaObject> Clone() const override;
  int64_t GetValue() const;

 private:
  explicit MetaInt(int64_t value);
  int64_t value_;
};

class MetaString : public MetaObject {
 public:
  static boost::shared_ptr<MetaString> New();
  static boost::shared_ptr<MetaString> New(const std::string& value);
  MetaType GetType() const override;
  boost::shared_ptr<MetaObject> Clone() const override;
  const std::string& GetValue() const;

 private:
  explicit MetaString(const std::string& value);
  std::string value_;
};

class MetaList;

// A named record of named fields. Fields keep the order in which they were
// first set; setting a field again replaces its value in place.
class MetaStruct : public MetaObject {
 public:
  static boost::shared_ptr<MetaStruct> New(const std::string& structureName);
  MetaType GetType() const override;
  boost::shared_ptr<MetaObject> Clone() const override;
  const std::string& GetName() const;

  void SetField(const std::string& field, const boost::shared_ptr<MetaBool>& value);
  void SetField(const std::string& field, const boost::shared_ptr<MetaInt>& value);
  void SetField(const std::string& field, const boost::shared_ptr<MetaList>& value);
  void SetField(const std::string& field, const boost::shared_ptr<MetaString>& value);
  void SetField(const std::string& field, const char* value);
  void SetField(const std::string& field, int64_t value);
  void SetField(const std::string& field, const std::string& value);
  void SetField(const std::string& field, const std::vector<std::string>& value);

  typedef std::vector<std::pair<std::string, boost::shared_ptr<MetaObject> > > Fields;
  // The fields in the order they were first set.
  const Fields& GetFields() const;
  // The value of a field, or an empty pointer when there is no such field.
  boost::shared_ptr<MetaObject> GetField(const std::string& field) const;

 private:
  explicit MetaStruct(const std::string& structureName);
  void Put(const std::string& field, const boost::shared_ptr<MetaObject>& value);
  std::string name_;
  Fields fields_;
};

// An ordered list of values of one kind, optionally with an element prototype
// (for a list of structures: the empty row that describes its fields).
class MetaList : public MetaObject {
 public:
  static boost::shared_ptr<MetaList> New(MetaType elementType);
  static boost::shared_ptr<MetaList> New(MetaType elementType,
                                         const boost::shared_ptr<MetaObject>& prototype);
  MetaType GetType() const override;
  boost::shared_ptr<MetaObject> Clone() const override;
  MetaType GetElementType() const;
  // The element prototype, or an empty pointer when none was given.
  boost::shared_ptr<MetaObject> GetPrototype() const;

  void Append(const boost::shared_ptr<MetaObject>& element);
  const std::vector<boost::shared_ptr<MetaObject> >& GetElements() const;
  std::size_t Size() const;

 private:
  MetaList(MetaType elementType, const boost::shared_ptr<MetaObject>& prototype);
  MetaType elementType_;
  boost::shared_ptr<MetaObject> prototype_;
  std::vector<boost::shared_ptr<MetaObject> > elements_;
};

}  // namespace MetaObj
}  // namespace Fendle

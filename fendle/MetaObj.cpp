#include "Fendle/MetaObj.h"

namespace Fendle {
namespace MetaObj {

namespace {

// Records have a handful of fields and most lists few elements, while a result
// may hold thousands of them: growing one slot at a time up to eight, then by
// doubling, keeps a small vector from carrying unused slots.
template <typename Vector>
void Grow(Vector& vector) {
  if (vector.size() < vector.capacity()) return;
  vector.reserve(vector.size() < 8 ? vector.size() + 1 : vector.size() * 2);
}

// Deep copy that tolerates an empty pointer, which a caller may have stored.
boost::shared_ptr<MetaObject> CloneOrEmpty(const boost::shared_ptr<MetaObject>& value) {
  return value ? value->Clone() : boost::shared_ptr<MetaObject>();
}

}  // namespace

MetaObject::~MetaObject() = default;

// MetaBool

MetaBool::MetaBool(bool value, bool hasValue) : value_(value), hasValue_(hasValue) {}

boost::shared_ptr<MetaBool> MetaBool::New() {
  return boost::shared_ptr<MetaBool>(new MetaBool(false, false));
}

boost::shared_ptr<MetaBool> MetaBool::New(bool value) {
  return boost::shared_ptr<MetaBool>(new MetaBool(value, true));
}

MetaType MetaBool::GetType() const { return MetaType::Bool; }

boost::shared_ptr<MetaObject> MetaBool::Clone() const {
  return boost::shared_ptr<MetaObject>(new MetaBool(value_, hasValue_));
}

bool MetaBool::GetValue() const { return value_; }

bool MetaBool::HasValue() const { return hasValue_; }

// MetaInt

MetaInt::MetaInt(int64_t value) : value_(value) {}

boost::shared_ptr<MetaInt> MetaInt::New() { return boost::shared_ptr<MetaInt>(new MetaInt(0)); }

boost::shared_ptr<MetaInt> MetaInt::New(int64_t value) {
  return boost::shared_ptr<MetaInt>(new MetaInt(value));
}

MetaType MetaInt::GetType() const { return MetaType::Int; }

boost::shared_ptr<MetaObject> MetaInt::Clone() const {
  return boost::shared_ptr<MetaObject>(new MetaInt(value_));
}

int64_t MetaInt::GetValue() const { return value_; }

// MetaString

MetaString::MetaString(const std::string& value) : value_(value) {}

boost::shared_ptr<MetaString> MetaString::New() {
  return boost::shared_ptr<MetaString>(new MetaString(std::string()));
}

boost::shared_ptr<MetaString> MetaString::New(const std::string& value) {
  return boost::shared_ptr<MetaString>(new MetaString(value));
}

MetaType MetaString::GetType() const { return MetaType::String; }

boost::shared_ptr<MetaObject> MetaString::Clone() const {
  return boost::shared_ptr<MetaObject>(new MetaString(value_));
}

const std::string& MetaString::GetValue() const { return value_; }

// MetaStruct

MetaStruct::MetaStruct(const std::string& structureName) : name_(structureName) {}

boost::shared_ptr<MetaStruct> MetaStruct::New(const std::string& structureName) {
  return boost::shared_ptr<MetaStruct>(new MetaStruct(structureName));
}

MetaType MetaStruct::GetType() const { return MetaType::Struct; }

boost::shared_ptr<MetaObject> MetaStruct::Clone() const {
  boost::shared_ptr<MetaStruct> copy(new MetaStruct(name_));
  copy->fields_.reserve(fields_.size());
  for (const auto& field : fields_) {
    copy->fields_.emplace_back(field.first, CloneOrEmpty(field.second));
  }
  return copy;
}

const std::string& MetaStruct::GetName() const { return name_; }

void MetaStruct::SetField(const std::string& field, const boost::shared_ptr<MetaBool>& value) {
  Put(field, value);
}

void MetaStruct::SetField(const std::string& field, const boost::shared_ptr<MetaInt>& value) {
  Put(field, value);
}

void MetaStruct::SetField(const std::string& field, const boost::shared_ptr<MetaList>& value) {
  Put(field, value);
}

void MetaStruct::SetField(const std::string& field, const boost::shared_ptr<MetaString>& value) {
  Put(field, value);
}

void MetaStruct::SetField(const std::string& field, const char* value) {
  // A null text would be undefined behaviour in std::string; it stands for "no text".
  Put(field, MetaString::New(value != nullptr ? std::string(value) : std::string()));
}

void MetaStruct::SetField(const std::string& field, int64_t value) {
  Put(field, MetaInt::New(value));
}

void MetaStruct::SetField(const std::string& field, const std::string& value) {
  Put(field, MetaString::New(value));
}

void MetaStruct::SetField(const std::string& field, const std::vector<std::string>& value) {
  boost::shared_ptr<MetaList> list = MetaList::New(MetaType::String);
  for (const std::string& element : value) list->Append(MetaString::New(element));
  Put(field, list);
}

const MetaStruct::Fields& MetaStruct::GetFields() const { return fields_; }

boost::shared_ptr<MetaObject> MetaStruct::GetField(const std::string& field) const {
  for (const auto& entry : fields_) {
    if (entry.first == field) return entry.second;
  }
  return boost::shared_ptr<MetaObject>();
}

void MetaStruct::Put(const std::string& field, const boost::shared_ptr<MetaObject>& value) {
  for (auto& entry : fields_) {
    if (entry.first == field) {
      entry.second = value;
      return;
    }
  }
  Grow(fields_);
  fields_.emplace_back(field, value);
}

// MetaList

MetaList::MetaList(MetaType elementType, const boost::shared_ptr<MetaObject>& prototype)
    : elementType_(elementType), prototype_(prototype) {}

boost::shared_ptr<MetaList> MetaList::New(MetaType elementType) {
  return boost::shared_ptr<MetaList>(new MetaList(elementType, boost::shared_ptr<MetaObject>()));
}

boost::shared_ptr<MetaList> MetaList::New(MetaType elementType,
                                          const boost::shared_ptr<MetaObject>& prototype) {
  return boost::shared_ptr<MetaList>(new MetaList(elementType, prototype));
}

MetaType MetaList::GetType() const { return MetaType::List; }

boost::shared_ptr<MetaObject> MetaList::Clone() const {
  boost::shared_ptr<MetaList> copy(new MetaList(elementType_, CloneOrEmpty(prototype_)));
  copy->elements_.reserve(elements_.size());
  for (const auto& element : elements_) copy->elements_.push_back(CloneOrEmpty(element));
  return copy;
}

MetaType MetaList::GetElementType() const { return elementType_; }

boost::shared_ptr<MetaObject> MetaList::GetPrototype() const { return prototype_; }

void MetaList::Append(const boost::shared_ptr<MetaObject>& element) {
  Grow(elements_);
  elements_.push_back(element);
}

const std::vector<boost::shared_ptr<MetaObject> >& MetaList::GetElements() const {
  return elements_;
}

std::size_t MetaList::Size() const { return elements_.size(); }

}  // namespace MetaObj
}  // namespace Fendle

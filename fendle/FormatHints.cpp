#include "fendle/FormatHints.h"

#include <algorithm>

namespace Fendle {
namespace Format {

using MetaObj::MetaObject;
using MetaObj::MetaStruct;

FormatHints::FormatHints(const Pairs& parameters, const boost::shared_ptr<MetaObject>& prototype)
    : parameters_(parameters), prototype_(prototype) {}

std::string FormatHints::Get(const std::string& key) const {
  for (const auto& pair : parameters_) {
    if (pair.first == key) return pair.second;
  }
  return std::string();
}

const boost::shared_ptr<MetaObject>& FormatHints::Prototype() const { return prototype_; }

std::vector<std::string> FormatHints::ListedFields(const std::string& structure) const {
  return SplitList(Get("fields:" + structure));
}

std::vector<std::string> FormatHints::DisplayFields(const MetaStruct& record) const {
  std::vector<std::string> fields;
  std::vector<std::string> listed = ListedFields(record.GetName());
  if (listed.empty()) {
    for (const auto& field : record.GetFields()) fields.push_back(field.first);
    return fields;
  }
  for (const std::string& name : listed) {
    // A field listed twice is shown once: a document must not repeat a key.
    if (std::find(fields.begin(), fields.end(), name) != fields.end()) continue;
    for (const auto& field : record.GetFields()) {
      if (field.first == name) {
        fields.push_back(name);
        break;
      }
    }
  }
  return fields;
}

bool FormatHints::HasHeading(const std::string& structure) const {
  return !Get("header:" + structure).empty();
}

std::string FormatHints::Heading(const MetaStruct& record) const {
  std::string pattern = Get("header:" + record.GetName());
  if (pattern.empty()) return record.GetName();
  // "%Name%" is the value of field Name; "%%" is a percent sign; a lone "%"
  // stays as written.
  std::string heading;
  std::string::size_type at = 0;
  while (at < pattern.size()) {
    std::string::size_type open = pattern.find('%', at);
    std::string::size_type close =
        open == std::string::npos ? std::string::npos : pattern.find('%', open + 1);
    if (close == std::string::npos) {
      heading += pattern.substr(at);
      break;
    }
    heading += pattern.substr(at, open - at);
    std::string name = pattern.substr(open + 1, close - open - 1);
    heading += name.empty() ? std::string("%") : ScalarText(record.GetField(name));
    at = close + 1;
  }
  // A heading made only of empty values would leave the record unmarked.
  return heading.empty() ? record.GetName() : heading;
}

std::string FormatHints::Unit(const std::string& structure, const std::string& field) const {
  return Get("units:" + structure + "." + field);
}

std::vector<std::string> FormatHints::TableColumns() const {
  return SplitList(Get("table-columns"));
}

std::vector<std::string> FormatHints::RecordColumns(const MetaObj::MetaList* list,
                                                    const MetaStruct* first) const {
  const MetaStruct* model = nullptr;
  if (list != nullptr) model = AsStruct(list->GetPrototype());
  if (model == nullptr) model = AsStruct(prototype_);
  if (model == nullptr) {
    if (const MetaObj::MetaList* declared = AsList(prototype_)) {
      model = AsStruct(declared->GetPrototype());
    }
  }
  if (model == nullptr) model = first;
  std::vector<std::string> columns;
  if (model != nullptr) columns = ListedFields(model->GetName());
  if (columns.empty()) columns = TableColumns();
  if (columns.empty() && model != nullptr) {
    for (const auto& field : model->GetFields()) columns.push_back(field.first);
  }
  return columns;
}

std::string FormatHints::ColumnTitle(const std::string& structure, const std::string& field) const {
  const std::string unit = Unit(structure, field);
  return unit.empty() ? field : field + " (" + unit + ")";
}

std::vector<std::string> SplitList(const std::string& text) {
  std::vector<std::string> items;
  std::string::size_type start = 0;
  while (start <= text.size()) {
    std::string::size_type comma = text.find(',', start);
    if (comma == std::string::npos) comma = text.size();
    if (comma > start) items.push_back(text.substr(start, comma - start));
    start = comma + 1;
  }
  return items;
}

const MetaStruct* AsStruct(const boost::shared_ptr<MetaObject>& value) {
  return dynamic_cast<const MetaStruct*>(value.get());
}

const MetaObj::MetaList* AsList(const boost::shared_ptr<MetaObject>& value) {
  return dynamic_cast<const MetaObj::MetaList*>(value.get());
}

std::string ScalarText(const boost::shared_ptr<MetaObject>& value) {
  // Cast by class rather than by GetType, so a value of a foreign class that
  // misreports its type is shown as empty rather than misread.
  if (auto* flag = dynamic_cast<const MetaObj::MetaBool*>(value.get())) {
    return flag->GetValue() ? "true" : "false";
  }
  if (auto* number = dynamic_cast<const MetaObj::MetaInt*>(value.get())) {
    return std::to_string(number->GetValue());
  }
  if (auto* text = dynamic_cast<const MetaObj::MetaString*>(value.get())) return text->GetValue();
  return std::string();
}

}  // namespace Format
}  // namespace Fendle

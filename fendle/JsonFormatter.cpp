#include <nlohmann/json.hpp>

#include "fendle/Formatter.h"

namespace Fendle {
namespace Format {

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace {

nlohmann::ordered_json ToJson(const boost::shared_ptr<MetaObject>& value,
                              const FormatHints& hints) {
  if (const MetaStruct* record = AsStruct(value)) {
    nlohmann::ordered_json object = nlohmann::ordered_json::object();
    for (const std::string& name : hints.DisplayFields(*record)) {
      object[name] = ToJson(record->GetField(name), hints);
    }
    return object;
  }
  if (const MetaList* list = AsList(value)) {
    nlohmann::ordered_json array = nlohmann::ordered_json::array();
    for (const auto& element : list->GetElements()) array.push_back(ToJson(element, hints));
    return array;
  }
  if (auto* flag = dynamic_cast<const MetaObj::MetaBool*>(value.get())) return flag->GetValue();
  if (auto* number = dynamic_cast<const MetaObj::MetaInt*>(value.get())) return number->GetValue();
  if (auto* text = dynamic_cast<const MetaObj::MetaString*>(value.get())) return text->GetValue();
  return nullptr;
}

}  // namespace

void JsonFormatter::Render(const boost::shared_ptr<MetaObject>& result, const FormatHints& hints,
                           std::ostream& out) const {
  if (!result) return;
  // Texts come from the host and may hold any bytes; replacing what is not
  // UTF-8 keeps the document valid instead of failing to write it.
  out << ToJson(result, hints).dump(2, ' ', false, nlohmann::json::error_handler_t::replace)
      << '\n';
}

}  // namespace Format
}  // namespace Fendle

// What a formatter knows besides the value it renders: the command's output
// hints and the result prototype its OutputSpec declares.
//
//   "fields:<Struct>"          comma-separated fields shown, in display order
//   "header:<Struct>"          heading of each record, "%Field%" marks a value
//   "units:<Struct>.<Field>"   unit written after the field's value
//   "table-columns"            comma-separated columns of a table
#pragma once

#include <boost/shared_ptr.hpp>
#include <string>
#include <utility>
#include <vector>

#include "Fendle/MetaObj.h"

namespace Fendle {
namespace Format {

class FormatHints {
 public:
  typedef std::vector<std::pair<std::string, std::string> > Pairs;

  FormatHints() = default;
  FormatHints(const Pairs& parameters, const boost::shared_ptr<MetaObj::MetaObject>& prototype);

  // The value of a hint, or an empty text.
  std::string Get(const std::string& key) const;
  const boost::shared_ptr<MetaObj::MetaObject>& Prototype() const;

  // The fields of record to show, in display order: the "fields:" hint's names
  // the record has, else every field in record order.
  std::vector<std::string> DisplayFields(const MetaObj::MetaStruct& record) const;
  // The names listed by the "fields:" hint of a structure; empty without one.
  std::vector<std::string> ListedFields(const std::string& structure) const;
  // The heading of record: its "header:" hint with each %Field% replaced by
  // that field's value, else (or when that comes out empty) the structure name.
  std::string Heading(const MetaObj::MetaStruct& record) const;
  // Does a "header:" hint exist for that structure.
  bool HasHeading(const std::string& structure) const;
  // The unit of a field, or an empty text.
  std::string Unit(const std::string& structure, const std::string& field) const;
  // The "table-columns" hint split at commas; empty without one.
  std::vector<std::string> TableColumns() const;
  // The columns of a table of records: the "fields:" hint of the structure
  // that stands for every row (the list's element prototype, else the declared
  // result's, else first), else the "table-columns" hint, else that
  // structure's fields. list and first may be null.
  std::vector<std::string> RecordColumns(const MetaObj::MetaList* list,
                                         const MetaObj::MetaStruct* first) const;
  // A column's title with its unit: "Size (MB)", or the name alone.
  std::string ColumnTitle(const std::string& structure, const std::string& field) const;

 private:
  Pairs parameters_;
  boost::shared_ptr<MetaObj::MetaObject> prototype_;
};

// Splits a comma-separated hint value, dropping empty entries.
std::vector<std::string> SplitList(const std::string& text);

// The value as a structure or a list, or null when it is something else.
const MetaObj::MetaStruct* AsStruct(const boost::shared_ptr<MetaObj::MetaObject>& value);
const MetaObj::MetaList* AsList(const boost::shared_ptr<MetaObj::MetaObject>& value);

// The text of a scalar (true/false, decimal, the string itself); empty for an
// absent value, a structure or a list.
std::string ScalarText(const boost::shared_ptr<MetaObj::MetaObject>& value);

}  // namespace Format
}  // namespace Fendle

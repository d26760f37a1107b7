// Which fields of reports are told as numbers, by what the schemas say of them.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "export/MetricTable.h"
#include "fleet/NumberBoard.h"
#include "fleet/NumberNames.h"

namespace qel::fleet {

// Every number that has a unit: qelwatch_<message>_<field>_<base unit>. Those of a list's entries
// have as labels the fields that tell the entries apart, and lists without such fields are left
// out; so are the levels of cells, which have names of their own (LatestNumbers). Where a report
// and its entries have a field of one name, that of entries is called entry_<field>. No text of a
// report is ever a label. One thread.
class FieldNumbers {
 public:
  FieldNumbers();

  // A payload that can be decoded, of that metric (16 bits).
  void tell(std::uint32_t metric, ByteView payload, std::uint64_t timeMs, NumberBoard& board) const;
  // What each family is called.
  std::vector<std::string> names() const;

 private:
  struct Number {
    std::size_t column = 0;
    NumberName name;
    std::string help;
  };
  struct Label {
    std::size_t column = 0;
    std::string name;
  };
  struct Report {
    explicit Report(const MetricMessage& itsMessage) : message(itsMessage), table(itsMessage) {}
    bool has(std::string_view name) const;
    const MetricMessage& message;
    MetricTable table;
    std::vector<Number> numbers;
    std::vector<Label> labels;  // of entries
  };

  std::map<std::uint32_t, Report> _reports;
};

}  // namespace qel::fleet

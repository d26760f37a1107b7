// How the reports of one message class stand in a table.
#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "export/Table.h"
#include "messages/catalogue/MetricMessages.h"
#include "metrics/BandwidthTable.h"
#include "metrics/DispatchTable.h"

namespace qel {

// Columns: time_utc, of reception; the fields, those of a nested message behind its name; and where
// the class has lists, which list and which entry (from 0), and the fields of entries. An entry is
// a row, with the report's own fields; a report without entries is one row. Lists share columns of
// one name, type and unit. Values are in the units that the dispatcher makes.
class MetricTable {
 public:
  explicit MetricTable(const MetricMessage& metric);

  const Table& table() const { return _table; }

  using PutRow = std::function<bool(const TableRow&)>;

  // Calls `put` for each row of a report as long as it answers true; whether it always did.
  bool rows(std::uint64_t timeMs, Dictionary record, const PutRow& put) const;
  // The same of a record whose values are in the units of the tables, whoever made it: a cell has
  // what stands there, whatever the type of its column.
  bool shownRows(std::uint64_t timeMs, const Dictionary& record, const PutRow& put) const;

 private:
  // A field and its column, or a nested message and its fields.
  struct Place {
    Name key;
    std::size_t column = 0;
    bool isTime = false;
    std::vector<Place> nested = {};
  };
  using Places = std::vector<Place>;
  struct ListPlace {
    Name key;
    Places fields;
    std::span<const Rewrite> rewrites;
  };
  struct Scope {
    std::string prefix;  // of nested messages
    std::string list;    // of an entry; empty: the report itself
    std::span<const Rewrite> rewrites;
  };

  enum class Values : std::uint8_t { reported, shown };

  bool putRows(std::uint64_t timeMs, const Dictionary& record, Values ofEntries,
               const PutRow& put) const;
  Places addFields(const MessageShape& shape, const Scope& scope);
  std::size_t addColumn(Column column, const Scope& scope);
  std::optional<std::size_t> find(const std::string& name, std::size_t from) const;
  void addLists(const MessageShape& shape, std::span<const ListCopy> copies);
  static void fill(TableRow& row, const Dictionary& record, const Places& places);

  Table _table;
  std::vector<Rewrite> _rewrites;  // of the report's own fields
  Places _fields;
  std::vector<ListPlace> _lists;
  std::size_t _firstOfEntries = 0;  // the column of the list's name, if there are lists
  const BandwidthTable _bandwidths = makeBandwidthTable();
};

}  // namespace qel

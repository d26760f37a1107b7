// Tables as files of comma-separated values.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "export/PartFile.h"
#include "export/Table.h"

namespace qel {

// TABLE.csv in a folder, for each table that has a row or was made (RFC 4180: lines end with CR LF;
// UTF-8). The first line names the columns, "rsrp [dBm]" where there is a unit. Nothing reported is
// an empty cell, bytes are "<0a1b2c>". A text that a spreadsheet would take for a formula begins
// with a "'".
class CsvSink final : public TableSink {
 public:
  // The folder is made if need be. Without `replaces` it must be empty; with it, files named as a
  // table of an export are replaced or go, and others stay. Nothing when it cannot be
  // used; `error` is then one line.
  static std::unique_ptr<CsvSink> create(const std::string& folder, bool replaces,
                                         std::string& error);
  ~CsvSink() override;

  bool make(const Table& table) override { return fileOf(table) != nullptr; }
  bool put(const Table& table, const TableRow& row) override;
  bool finish() override;
  const std::string& error() const override { return _error; }

 private:
  struct File {
    explicit File(std::string path) : part(std::move(path)) {}
    PartFile part;
    std::string waiting;
  };

  CsvSink(std::string folder, bool isOwn) : _folder(std::move(folder)), _isOwn(isOwn) {}
  File* fileOf(const Table& table);
  bool flush(File& file);
  bool fail(const File& file);
  bool dropOthers();

  const std::string _folder;
  bool _isOwn;  // to be removed when nothing comes of it
  std::map<const Table*, std::unique_ptr<File>> _files;
  std::string _error;
};

}  // namespace qel

#include "export/CsvSink.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <set>
#include <string_view>
#include <system_error>

#include "base/Rendering.h"
#include "export/HappeningTable.h"
#include "messages/catalogue/MetricMessages.h"

namespace qel {
namespace {

namespace fs = std::filesystem;

constexpr std::size_t kMostWaiting = 64 * 1024;  // bytes of one file
constexpr std::string_view kEnding = ".csv";

void appendCell(std::string& line, std::string_view text) {
  if (!text.empty() && text.find_first_of(",\"\r\n") == std::string_view::npos) {
    line += text;
    return;
  }
  line += '"';
  for (const char c : text) {
    if (c == '"') line += '"';
    line += c;
  }
  line += '"';
}

std::string headOf(const Table& table) {
  std::string line;
  for (const Column& column : table.columns) {
    if (!line.empty()) line += ',';
    appendCell(line, column.unit.empty() ? column.name : column.name + " [" + column.unit + "]");
  }
  return line + "\r\n";
}

// Whether an export may have made a file of this name.
bool isTableName(std::string_view name) {
  return name == happeningTable().name ||
         std::ranges::any_of(metricMessages(), [name](const MetricMessage& message) {
           return message.className == name;
         });
}

// A spreadsheet takes such a text for a formula.
bool looksLikeFormula(std::string_view text) {
  return !text.empty() && std::string_view("=+-@\t\r").find(text.front()) != std::string_view::npos;
}

std::string textIn(const Column& column, const Value& value) {
  std::string text = cellText(value);
  if (column.type == ColumnType::text && looksLikeFormula(text)) text.insert(0, 1, '\'');
  return text;
}

}  // namespace

std::unique_ptr<CsvSink> CsvSink::create(const std::string& folder, bool replaces,
                                         std::string& error) {
  // It tells where a phone has been.
  const bool isMade = ::mkdir(folder.c_str(), 0700) == 0;
  if (!isMade && errno != EEXIST) {
    error = folder + ": " + std::strerror(errno);
    return nullptr;
  }
  std::error_code code;
  const bool isEmpty = fs::is_empty(folder, code);
  if (code || !fs::is_directory(folder, code)) {
    error = folder + ": " + std::strerror(code ? code.value() : ENOTDIR);
    return nullptr;
  }
  if (!isEmpty && !replaces) {
    error = folder + ": " + std::strerror(ENOTEMPTY);
    return nullptr;
  }
  return std::unique_ptr<CsvSink>(new CsvSink(folder, isMade));
}

CsvSink::~CsvSink() {
  _files.clear();
  if (_isOwn) ::rmdir(_folder.c_str());
}

bool CsvSink::fail(const File& file) {
  _error = file.part.error();
  return false;
}

CsvSink::File* CsvSink::fileOf(const Table& table) {
  if (!_error.empty()) return nullptr;
  auto& file = _files[&table];
  if (file) return file.get();
  file = std::make_unique<File>(_folder + "/" + table.name + std::string(kEnding));
  file->waiting = headOf(table);
  if (file->part.create()) return file.get();
  fail(*file);
  return nullptr;
}

bool CsvSink::flush(File& file) {
  const bool isWritten = file.part.write(file.waiting);
  file.waiting.clear();
  return isWritten || fail(file);
}

bool CsvSink::put(const Table& table, const TableRow& row) {
  File* file = fileOf(table);
  if (!file) return false;
  bool isFirst = true;
  for (const Value& value : row) {
    if (!isFirst) file->waiting += ',';
    isFirst = false;
    const Column& column = table.columns[static_cast<std::size_t>(&value - row.data())];
    if (!value.isNull()) appendCell(file->waiting, textIn(column, value));
  }
  file->waiting += "\r\n";
  return file->waiting.size() < kMostWaiting || flush(*file);
}

// What is left in the folder of an export before.
bool CsvSink::dropOthers() {
  std::set<std::string> others;
  std::error_code code;
  for (fs::directory_iterator entry(_folder, code), end; !code && entry != end;
       entry.increment(code)) {
    const fs::path name = entry->path().filename();
    if (name.extension() == kEnding && isTableName(name.stem().string())) others.insert(name);
  }
  for (const auto& [table, file] : _files) others.erase(table->name + std::string(kEnding));
  for (const std::string& name : others) {
    const std::string path = _folder + "/" + name;
    if (::unlink(path.c_str()) == 0) continue;
    _error = path + ": " + std::strerror(errno);
    return false;
  }
  return true;
}

bool CsvSink::finish() {
  if (!_error.empty()) return false;
  for (const auto& [table, file] : _files) {
    if (!flush(*file)) return false;
    if (!file->part.complete()) return fail(*file);
  }
  _isOwn = false;
  for (const auto& [table, file] : _files) {
    if (!file->part.takePlace()) return fail(*file);
  }
  return dropOthers();
}

}  // namespace qel

#include "export/CsvSink.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <string_view>
#include <system_error>

#include "base/Rendering.h"

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

// Whether the file is a table of an export: others begin otherwise.
bool isTable(const std::string& path) {
  constexpr std::string_view kBegin = "time_utc";
  std::array<char, kBegin.size()> begin{};
  std::ifstream(path, std::ios::binary).read(begin.data(), begin.size());
  return std::string_view(begin.data(), begin.size()) == kBegin;
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
    if (!value.isNull()) appendCell(file->waiting, cellText(value));
  }
  file->waiting += "\r\n";
  return file->waiting.size() < kMostWaiting || flush(*file);
}

// What is left in the folder of an export before.
bool CsvSink::dropOthers() {
  std::error_code code;
  for (const fs::directory_entry& entry : fs::directory_iterator(_folder, code)) {
    const std::string path = _folder + "/" + entry.path().filename().string();
    const bool isOurs = std::ranges::any_of(
        _files, [&path](const auto& file) { return file.second->part.path() == path; });
    if (isOurs || entry.path().extension() != kEnding || !entry.is_regular_file(code)) continue;
    if (!isTable(path)) continue;
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
  if (!dropOthers()) return false;
  _isOwn = false;
  for (const auto& [table, file] : _files) {
    if (!file->part.takePlace()) return fail(*file);
  }
  return true;
}

}  // namespace qel

#include "fleet/collect/CopyRows.h"

#include <cmath>
#include <utility>

#include "base/Rendering.h"
#include "base/Utf8.h"

namespace qel::fleet {
namespace {

// The text of a time that has a date; later ones are the database's "infinity".
CopyCell timeCell(const Value& value) {
  constexpr std::string_view kForm = "2026-11-22T10:00:00.000Z";
  const auto text = value.asText();
  if (!text || text->empty()) return std::nullopt;
  if (text->find_first_not_of("0123456789") == std::string_view::npos) return "infinity";
  const bool isTime = text->size() == kForm.size() && (*text)[10] == 'T' && text->back() == 'Z';
  return isTime ? CopyCell(*text) : std::nullopt;
}

CopyCell integerCell(const Value& value) {
  const auto number = value.asInt64();
  return number ? CopyCell(std::to_string(*number)) : std::nullopt;
}

CopyCell realCell(const Value& value) {
  if (value.kind() != Value::Kind::floating) return integerCell(value);
  return jsonText(value);  // its shortest text
}

CopyCell bytesCell(const Value& value) {
  if (const Bytes* bytes = value.asBytes()) return "\\x" + hexText(*bytes);
  const auto text = value.asText();  // as JSON has them
  if (!text || text->size() < 2 || !text->starts_with('<') || !text->ends_with('>')) {
    return std::nullopt;
  }
  const auto bytes = bytesFromHex(text->substr(1, text->size() - 2));
  return bytes ? CopyCell("\\x" + hexText(*bytes)) : std::nullopt;
}

CopyCell cellFor(const FleetColumn& column, const Value& value) {
  if (column.isTime) return timeCell(value);
  switch (column.type) {
    case ColumnType::integer:
      return integerCell(value);
    case ColumnType::real:
      return realCell(value);
    case ColumnType::bytes:
      return bytesCell(value);
    case ColumnType::text:
      break;
  }
  return databaseText(cellText(value));
}

bool isNothing(const Value& value) {
  return value.isNull() ||
         (value.kind() == Value::Kind::floating && !std::isfinite(value.asFloat().value_or(0)));
}

}  // namespace

std::string databaseText(std::string_view text) {
  std::string valid = withReplacements(text);
  for (std::size_t at = 0; (at = valid.find('\0', at)) != std::string::npos;) {
    valid.replace(at, 1, "\uFFFD");
  }
  return valid;
}

bool CopyRows::addCell(const FleetColumn& column, const Value& value, CopyRow& row) {
  if (isNothing(value)) {
    row.emplace_back();
    return true;
  }
  row.push_back(cellFor(column, value));
  if (!row.back()) {
    _fault = column.name + " is not of type " + std::string(column.sqlType);
    return false;
  }
  _bytes += row.back()->size();
  return true;
}

bool CopyRows::add(const TableRow& row) {
  if (_rows.size() == kMostRowsOfAnEvent) {
    _fault = "more than " + std::to_string(kMostRowsOfAnEvent) + " entries";
    return false;
  }
  CopyRow copied;
  copied.reserve(_columns.size());
  for (std::size_t i = 0; i < _columns.size(); ++i) {
    if (!addCell(_columns[i], row[i + 1], copied)) return false;
  }
  _bytes += _columns.size() * sizeof(CopyCell);
  if (_bytes > kMostBytesOfAnEvent) {
    _fault = "more than " + std::to_string(kMostBytesOfAnEvent) + " bytes of rows";
    return false;
  }
  _rows.push_back(std::move(copied));
  return true;
}

}  // namespace qel::fleet

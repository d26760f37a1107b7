// The entries of a payload in one row, those within others behind them; what is not a number is a
// view into the payload or the schemas. As little as a program can do that only wants to look.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "base/Bytes.h"
#include "peers/FieldTables.h"

namespace qel::bench {

struct FlatEntry {
  enum class Kind : std::uint8_t { truth, number, negative, name, text, bytes, list, entries };

  std::string_view key;  // empty for an element of a list
  std::string_view text;
  std::uint64_t number = 0;  // a negative one as two's complement
  std::uint32_t end = 0;     // of what a list or entries hold: the position behind it
  Kind kind = Kind::number;
};

using FlatEntries = std::vector<FlatEntry>;

// Reads a payload into `entries`; what was there goes. Damaged ones end the program; a list whose
// elements do not stand together becomes two. The payload must stay.
void readFlat(const Fields& fields, ByteView payload, FlatEntries& entries);

// Every key and value.
std::size_t visit(const FlatEntries& entries);

// As JSON on one line.
std::string flatText(const FlatEntries& entries);

}  // namespace qel::bench

// The dictionary form of a payload, as one writes it down without further thought.
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "base/Bytes.h"

namespace qel::bench {

struct PlainEntry;
struct PlainValue;
using PlainEntries = std::vector<PlainEntry>;
using PlainList = std::vector<PlainValue>;

// Names of enum values are views, texts and bytes are owned.
struct PlainValue {
  std::variant<bool, std::int64_t, std::uint64_t, std::string_view, std::string, Bytes, PlainList,
               PlainEntries>
      is;
};

struct PlainEntry {
  std::string_view key;
  PlainValue value;
};

// Reads payloads of one metric. Damaged ones end the program.
using EntriesReader = std::function<PlainEntries(const Bytes& payload)>;
EntriesReader stockEntries(std::uint32_t metric);  // by libprotobuf's reflection
EntriesReader protozeroEntries(std::uint32_t metric);

// Every key and value of the entries and of those within them.
std::size_t visit(const PlainEntries& entries);

// The list under the key, which is looked for from the end; made when there is none.
PlainList& listOf(PlainEntries& entries, std::string_view key);

// As JSON on one line, with fmt, appended to `out`.
void appendFmt(std::string& out, const PlainEntries& entries);

}  // namespace qel::bench

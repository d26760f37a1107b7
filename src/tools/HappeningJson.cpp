#include "tools/HappeningJson.h"

#include <cstdint>
#include <string>

namespace qel::tools {
namespace {

Value orNull(std::optional<std::uint32_t> number) { return number ? Value(*number) : Value(); }
Value orNull(const std::string& text) { return text.empty() ? Value() : Value(text); }

}  // namespace

Value asJson(const std::optional<Cell>& cell) {
  if (!cell) return {};
  return Dictionary{{"technology", nameOf(cell->technology)},
                    {"channel", orNull(cell->channel)},
                    {"code", orNull(cell->code)},
                    {"cell_id", orNull(cell->cellId)},
                    {"area", orNull(cell->area)},
                    {"mcc", orNull(cell->mcc)},
                    {"mnc", orNull(cell->mnc)}};
}

Dictionary asJson(const Happening& happening) {
  const auto& technology = happening.technology;
  Dictionary object{{"time_ms", happening.timeMs},
                    {"kind", nameOf(happening.kind)},
                    {"technology", technology ? Value(nameOf(*technology)) : Value()},
                    {"metric", happening.metric == 0 ? Value() : Value(happening.metric)},
                    {"text", happening.text}};
  if (happening.kind == HappeningKind::cell) {
    object.append("from", asJson(happening.from));
    object.append("to", asJson(happening.to));
  }
  return object;
}

}  // namespace qel::tools

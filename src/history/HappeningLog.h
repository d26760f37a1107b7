// The happenings, in the order in which they became known.
#pragma once

#include <array>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>

#include "base/Value.h"
#include "history/Happening.h"
#include "history/ReportedCell.h"

namespace qel {

// A report on its way to what follows from it.
struct Report {
  std::int64_t metric;
  const Dictionary& record;
  std::uint64_t timeMs;  // of reception
  std::uint64_t atMs;    // the same, but never before that of another report
};

// A happening before it is put into words, which it is when somebody looks.
struct ToldConnection {
  ToldConnection(const Value& itsState, const Value& itsCause) : state(itsState), cause(itsCause) {}
  Value state;
  Value cause;  // null: none
};
struct ToldCell {
  ToldCell(const std::optional<ReportedCell>& itsFrom, const ReportedCell& itsTo, CellMove itsMove)
      : from(itsFrom), to(itsTo), move(itsMove) {}
  std::optional<ReportedCell> from;
  ReportedCell to;
  CellMove move;
};
struct ToldTechnology {
  Technology from;
  Technology to;
};
struct ToldStatus {
  std::string_view domain;  // of the registration, as it is called
  Value status;
};
// Of a list, something that has come or gone.
struct ToldEntry {
  std::array<Value, 3> numbers;
  Text name;
  Value type;
  bool hasCome = false;
};
using Told =
    std::variant<std::string, ToldConnection, ToldCell, ToldTechnology, ToldStatus, ToldEntry>;

// Beyond `most` the oldest go.
class HappeningLog {
 public:
  explicit HappeningLog(std::size_t most) : _most(most) {}

  template <class What, class... Arguments>
  void tell(const Report& report, HappeningKind kind, std::optional<Technology> technology,
            Arguments&&... arguments) {
    _unworded.emplace_back(report, kind, technology, std::in_place_type<What>,
                           std::forward<Arguments>(arguments)...);
    if (++_count > _most) dropOldest();
  }
  void tellText(const Report& report, HappeningKind kind, std::optional<Technology> technology,
                std::string text) {
    tell<std::string>(report, kind, technology, std::move(text));
  }
  // `atMs` never goes back.
  void add(Happening happening, std::uint64_t atMs);

  const std::deque<Happening>& all() const;
  std::uint64_t gone() const { return _gone; }
  // How many of all() are not after this time.
  std::size_t until(std::uint64_t atMs) const;

 private:
  struct Unworded {
    template <class What, class... Arguments>
    Unworded(const Report& report, HappeningKind itsKind, std::optional<Technology> itsTechnology,
             std::in_place_type_t<What> what, Arguments&&... arguments)
        : timeMs(report.timeMs),
          atMs(report.atMs),
          metric(report.metric),
          kind(itsKind),
          technology(itsTechnology),
          told(what, std::forward<Arguments>(arguments)...) {}

    std::uint64_t timeMs;
    std::uint64_t atMs;
    std::int64_t metric;
    HappeningKind kind;
    std::optional<Technology> technology;
    Told told;
  };

  static Happening worded(const Unworded& happening);
  void dropOldest();

  std::size_t _most;
  std::size_t _count = 0;  // of both
  std::uint64_t _gone = 0;
  mutable std::deque<Happening> _worded;        // the older ones,
  mutable std::deque<std::uint64_t> _wordedAt;  // and the times that count of them
  mutable std::deque<Unworded, SmallBlockAllocator<Unworded>> _unworded;  // the newer ones
};

}  // namespace qel

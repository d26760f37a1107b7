// How it is with what stands behind a source: its modem, or its recording.
#pragma once

#include <string>
#include <string_view>

namespace qel::sources {

// Words of the program's own, but for the names, which the modem gives and which are short
// printable ASCII, and what a reason quotes of a file, short and printable. Nothing in it tells one
// modem from another of its kind.
struct SourceCondition {
  std::string_view state;     // one word for programs; empty: there is nothing to say
  std::string_view headline;  // for people
  std::string reason;         // why, for people, where there is more to say
  std::string model = {};
  std::string driver = {};

  friend bool operator==(const SourceCondition&, const SourceCondition&) = default;
};

// One line for people, without the names.
inline std::string inWords(const SourceCondition& condition) {
  std::string words(condition.headline);
  if (!condition.reason.empty()) words.append(": ").append(condition.reason);
  return words;
}

}  // namespace qel::sources

// What a schema says of a field besides its type: its options and its comment.
#pragma once

#include <google/protobuf/descriptor.h>

#include <optional>
#include <string>
#include <vector>

namespace qel::generator {

// A comment without its clauses, and these: "36.211, clause 6.11", several with "; " between.
struct Meaning {
  std::string text;
  std::string clause;
};
Meaning meaningOf(std::string_view comment);

struct Facts {
  Meaning meaning;  // the clause of the enumeration or message where the field itself names none
  std::string label;
  std::string unit;
  std::string raw;
  std::optional<double> least;
  std::optional<double> most;
  std::string form;     // "plain", "utranCell"
  std::string quality;  // "RSRP"; empty: none
  bool identifies = false;
};

// Ends the generator with a message when the field has no label.
Facts factsOf(const google::protobuf::FieldDescriptor& field);

// "-140 to -43 dBm"; with one end or none what there is of it.
std::string rangeText(const Facts& facts);

// The metric whose payload the message is; 0: none.
unsigned metricOf(const google::protobuf::Descriptor& message);

// A scale by which a quantity is judged.
struct Scale {
  std::string name;
  std::string unit;
  float lowest = 0;
  float highest = 0;
  float good = 0;
  float fair = 0;
};
std::vector<Scale> scales();

}  // namespace qel::generator

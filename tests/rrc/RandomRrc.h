// Random messages of a schema, encoded without the reader, and what they say.
#pragma once

#include <random>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "rrc/BitWriter.h"
#include "rrc/Token.h"

namespace qel::testing {

struct RandomRrcMessage {
  Bytes pdu;
  std::vector<Token> tokens;
};

// Never chooses what the schema does not read, if there is something else.
class RandomRrc {
 public:
  struct Choice {
    unsigned seed = 1;
    bool foreign = false;              // puts additions in that the schema passes over
    std::set<std::string> never = {};  // fields and alternatives that are never chosen
  };
  RandomRrc(const rrc::generator::Tables& tables, Choice choice)
      : _tables(tables),
        _choice(std::move(choice)),
        _engine(_choice.seed),
        _uses(tables.fields.size()) {}

  RandomRrcMessage message(rrc::TypeIndex type);

  // Whether there is something to read in that field or alternative.
  bool mayChoose(const rrc::Type& type, std::size_t index) const;

 private:
  void write(BitWriter& bits, rrc::TypeIndex index, const std::string& name, int depth);
  void scalar(BitWriter& bits, const rrc::Type& type, const std::string& name);
  void string(BitWriter& bits, const rrc::Type& type, const std::string& name, int depth);
  void list(BitWriter& bits, const rrc::Type& type, const std::string& name, int depth);
  void sequence(BitWriter& bits, const rrc::Type& type, int depth);
  void choice(BitWriter& bits, const rrc::Type& type, const std::string& name, int depth);
  std::vector<bool> chosenAdditions(const rrc::Type& type, int depth);
  void additions(BitWriter& bits, const rrc::Type& type, const std::vector<bool>& chosen,
                 int depth);

  std::uint64_t upTo(std::uint64_t most) { return _engine() % (most + 1); }
  bool chance(unsigned percent) { return upTo(99) < percent; }
  std::int64_t between(std::int64_t low, std::int64_t high);
  std::size_t alternative(const rrc::Type& type);
  bool wants(const rrc::Type& type, std::size_t index, int depth);
  const rrc::Field& field(const rrc::Type& type, std::size_t index) const {
    return _tables.fields[type.first + index];
  }
  const std::string& nameOf(const rrc::Type& type, std::size_t index) const {
    return _tables.fieldNames[type.first + index];
  }
  Bytes randomBytes(std::size_t size);

  const rrc::generator::Tables& _tables;
  Choice _choice;
  std::mt19937_64 _engine;
  std::vector<unsigned> _uses;  // of each field: those that were seldom chosen are preferred
  std::vector<Token> _tokens;
};

}  // namespace qel::testing

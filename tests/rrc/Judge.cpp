#include "rrc/Judge.h"

#include <algorithm>
#include <sstream>

#include "rrc/Token.h"
#include "rrc/reader/Walker.h"

namespace qel::testing {
namespace {

bool agrees(const Token& token, const Shown& shown) {
  if (!shown.name.ends_with(token.name)) return false;  // it has a geran-q-RxLevMin
  const bool number = !token.number.empty() && token.number == shown.value;
  const bool bytes = (token.number.empty() || !token.hex.empty()) && token.hex == shown.value;
  if (!number && !bytes) return false;
  return token.chosen.empty() || shown.label.empty() || token.chosen == shown.label;
}

bool isCompared(const Shown& shown, const Peculiarities& peculiarities) {
  return !peculiarities.reckoned.contains(shown.name) &&
         std::none_of(shown.path.begin(), shown.path.end(),
                      [&](const std::string& name) { return peculiarities.opaque.contains(name); });
}

class Comparison {
 public:
  Comparison(Judgement& judgement, bool mayShowMore)
      : _judgement(judgement), _mayShowMore(mayShowMore) {}

  // `stopped`: the schema does not say what stands behind the last of the tokens.
  void compare(const JudgedMessage& message, const std::vector<Token>& tokens,
               const std::vector<Shown>& shown, bool stopped) {
    std::size_t next = 0;
    for (const Token& token : tokens) {
      ++_judgement.fields;
      std::size_t found = next;
      while (_mayShowMore && found < shown.size() && !agrees(token, shown[found])) ++found;
      if (found >= shown.size() || !agrees(token, shown[found])) {
        return differ(message, token, next < shown.size() ? &shown[next] : nullptr);
      }
      _judgement.further += found - next;
      next = found + 1;
    }
    _judgement.further += shown.size() - next;
    const bool mayEnd = _mayShowMore || stopped || next == shown.size();
    if (!mayEnd) differ(message, {}, &shown[next]);
  }

 private:
  void differ(const JudgedMessage& message, const Token& token, const Shown* shown) {
    std::ostringstream text;
    text << message.dissector << ' ' << hexText(message.pdu) << "\n  read:  " << token
         << "\n  shown: ";
    if (shown != nullptr) text << shown->name << " = " << shown->value << ' ' << shown->label;
    _judgement.differences.push_back(text.str());
  }

  Judgement& _judgement;
  bool _mayShowMore;
};

}  // namespace

Judgement judge(const rrc::generator::Tables& tables, const std::vector<JudgedType>& messages,
                const std::vector<std::vector<Shown>>& shown, const Peculiarities& peculiarities,
                bool mayShowMore) {
  Judgement judgement;
  Comparison comparison(judgement, mayShowMore);
  const rrc::Schema schema = tables.schema();
  for (std::size_t i = 0; i < messages.size(); ++i) {
    const auto reading = rrc::walk(schema, messages[i].type, messages[i].message.pdu);
    if (!reading) {
      judgement.differences.push_back("not read: " + hexText(messages[i].message.pdu));
      continue;
    }
    for (const rrc::Found& found : reading->found) judgement.kinds.insert(found.mark);
    std::vector<Token> tokens = tokensOf(*reading, tables);
    std::erase_if(tokens, [&](const Token& token) {
      return !token.name.empty() && peculiarities.reckoned.contains(token.name);
    });
    std::vector<Shown> compared = shown[i];
    std::erase_if(compared, [&](const Shown& one) { return !isCompared(one, peculiarities); });
    const bool stopped = schema[reading->found.back().type].kind == rrc::Kind::stop;
    comparison.compare(messages[i].message, tokens, compared, stopped);
  }
  return judgement;
}

}  // namespace qel::testing

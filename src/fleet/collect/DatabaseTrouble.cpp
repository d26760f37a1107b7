#include "fleet/collect/DatabaseTrouble.h"

#include <pqxx/pqxx>
#include <string_view>

#include "base/TerminalText.h"

namespace qel::fleet {
namespace {

// Of several lines the first one, and not what stands before all of them.
std::string firstLine(std::string_view text) {
  for (const std::string_view start : {"ERROR:  ", "FATAL:  "}) {
    if (text.starts_with(start)) text.remove_prefix(start.size());
  }
  return forTerminal(text.substr(0, text.find('\n')));
}

DatabaseTrouble::Kind kindOf(const std::string& state) {
  if (state == "42501" || state.starts_with("28")) return DatabaseTrouble::Kind::refused;
  const bool isMissing =
      state == "42P01" || state == "42703" || state == "42883" || state == "3F000";
  return isMissing ? DatabaseTrouble::Kind::layout : DatabaseTrouble::Kind::away;
}

}  // namespace

bool guarded(const std::function<void()>& work, DatabaseTrouble& trouble) {
  try {
    work();
    return true;
  } catch (const WrongLayout& error) {
    trouble = {DatabaseTrouble::Kind::layout, error.what()};
  } catch (const pqxx::sql_error& error) {
    trouble = {kindOf(error.sqlstate()), firstLine(error.what())};
  } catch (const std::exception& error) {
    trouble = {DatabaseTrouble::Kind::away, firstLine(error.what())};
  }
  return false;
}

}  // namespace qel::fleet

// The dashboards as they are installed, and the questions in them.
#pragma once

#include <map>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace qel::testing {

// By the name of its file.
std::map<std::string, nlohmann::json> dashboards();

struct DashboardQuery {
  std::string place;   // "fleet: Rejects by cause A", or of a variable "fleet: $phone"
  std::string source;  // the data source's uid
  std::string text;
};

// Those of every panel and every variable.
std::vector<DashboardQuery> dashboardQueries();

// What Grafana puts in the places of variables and macros, for a panel that shows these times.
class GrafanaValues {
 public:
  // Seconds since 1970.
  GrafanaValues(std::int64_t fromS, std::int64_t toS) : _fromS(fromS), _toS(toS) {}

  GrafanaValues& with(const std::string& variable, const std::string& value) {
    _variables[variable] = value;
    return *this;
  }
  // "$name" and "${name:sqlstring}"; $__interval, $__rate_interval; $__timeFilter(column),
  // $__timeGroup(column, step), $__timeGroupAlias(column, step). Whatever else begins with a "$" is
  // left, for the database to complain of.
  std::string filled(std::string query) const;

 private:
  std::int64_t _fromS;
  std::int64_t _toS;
  std::map<std::string, std::string> _variables;
};

}  // namespace qel::testing

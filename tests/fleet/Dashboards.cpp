#include "fleet/Dashboards.h"

#include <filesystem>
#include <fstream>
#include <regex>

namespace qel::testing {
namespace {

using nlohmann::json;

constexpr const char* kInterval = "1m";

void replaceAll(std::string& text, const std::string& what, const std::string& by) {
  for (std::size_t at = 0; (at = text.find(what, at)) != std::string::npos; at += by.size()) {
    text.replace(at, what.size(), by);
  }
}

std::string textOf(const json& target) {
  return target.contains("expr") ? target.at("expr") : target.at("rawSql");
}

void addVariables(const std::string& name, const json& dashboard,
                  std::vector<DashboardQuery>& queries) {
  for (const json& variable : dashboard.at("templating").at("list")) {
    if (variable.at("type") != "query") continue;
    const json& query = variable.at("query");
    queries.push_back({name + ": $" + std::string(variable.at("name")),
                       variable.at("datasource").at("uid"),
                       query.is_string() ? query : query.at("query")});
  }
}

// Seconds of "'1h'" or "1m".
std::string secondsOf(std::string step) {
  std::erase(step, '\'');
  const char unit = step.back();
  const int factor = unit == 'h' ? 3600 : unit == 'm' ? 60 : 1;
  return std::to_string(std::stoi(step) * factor);
}

}  // namespace

std::map<std::string, json> dashboards() {
  std::map<std::string, json> all;
  for (const auto& entry : std::filesystem::directory_iterator(QEL_SHARE "/grafana/dashboards")) {
    std::ifstream stream(entry.path());
    all.emplace(entry.path().stem().string(), json::parse(stream));
  }
  return all;
}

std::vector<DashboardQuery> dashboardQueries() {
  std::vector<DashboardQuery> queries;
  for (const auto& [name, dashboard] : dashboards()) {
    addVariables(name, dashboard, queries);
    for (const json& panel : dashboard.at("panels")) {
      for (const json& target : panel.at("targets")) {
        const std::string title = panel.at("title");
        const std::string reference = target.at("refId");
        queries.push_back({name + ": " + title + " " + reference, target.at("datasource").at("uid"),
                           textOf(target)});
      }
    }
  }
  return queries;
}

std::string GrafanaValues::filled(std::string query) const {
  for (const auto& [name, value] : _variables) {
    std::string quoted = value;
    replaceAll(quoted, "'", "''");
    replaceAll(query, "${" + name + ":sqlstring}", "'" + quoted + "'");
    replaceAll(query, "$" + name, value);
  }
  replaceAll(query, "$__interval", kInterval);
  replaceAll(query, "$__rate_interval", kInterval);
  const auto time = [](std::int64_t seconds) {
    return "to_timestamp(" + std::to_string(seconds) + ")";
  };
  query = std::regex_replace(query, std::regex(R"(\$__timeFilter\((\w+)\))"),
                             "$1 BETWEEN " + time(_fromS) + " AND " + time(_toS));
  static const std::regex kGroup(R"(\$__timeGroup(Alias)?\((\w+), *([^)]*)\))");
  for (std::smatch found; std::regex_search(query, found, kGroup);) {
    const std::string step = secondsOf(found[3]);
    query = found.prefix().str() + "floor(extract(epoch from " + found[2].str() + ")/" + step +
            ")*" + step + (found[1].matched ? " AS \"time\"" : "") + found.suffix().str();
  }
  return query;
}

}  // namespace qel::testing

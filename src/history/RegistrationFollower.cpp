#include "history/RegistrationFollower.h"

#include <algorithm>
#include <optional>
#include <string_view>
#include <utility>

#include "history/Words.h"
#include "metrics/MetricValidator.h"

namespace qel {
namespace {

struct Domain {
  std::int64_t metric;
  std::optional<Technology> technology;
  std::string_view name;
};

constexpr std::array kDomains = {
    Domain{MetricValidator::K_LTE_EMM_CTXT, Technology::lte, "LTE"},
    Domain{MetricValidator::K_CELLULAR_GMM_CTXT, std::nullopt, "Packet service of 2G and 3G"},
    Domain{MetricValidator::K_CELLULAR_MM_CTXT, std::nullopt, "Calls of 2G and 3G"},
};

// "network not allowed (cause 11)"; empty: none.
std::string causeText(const Value& cause) {
  const NamedWords* words = wordsFor(cause.asText().value_or(""));
  if (!words) return wordsOf(&cause, "cause");
  if (words->words.empty()) return {};
  return std::string(words->words) + " (cause " + std::to_string(words->number) + ")";
}

std::string rejectText(const Domain& domain, const Dictionary& record, const std::string& cause) {
  std::string procedure = wordsOf(record.find("reg_proc"), "procedure");
  if (procedure.empty()) procedure = "registration";
  return std::string(domain.name) + ": " + procedure + " rejected, " + cause;
}

}  // namespace

bool RegistrationFollower::Field::isNewIn(const Dictionary& record) {
  const Value* value = place.in(record);
  if (!value || *value == known) return false;
  known = *value;
  return true;
}

void RegistrationFollower::follow(const Report& report, HappeningLog& log) {
  const auto domain = std::ranges::find(kDomains, report.metric, &Domain::metric);
  if (domain == kDomains.end()) return;
  auto& [status, reject, failure] = _known[static_cast<std::size_t>(domain - kDomains.begin())];
  const Dictionary& record = report.record;
  if (status.isNewIn(record)) {
    log.tell<ToldStatus>(report, HappeningKind::registration, domain->technology,
                         ToldStatus{domain->name, status.known});
  }
  if (reject.isNewIn(record)) {
    const std::string cause = causeText(reject.known);
    if (!cause.empty()) {
      log.tellText(report, HappeningKind::reject, domain->technology,
                   rejectText(*domain, record, cause));
    }
  }
  // A rejected procedure has failed too: its cause has been told.
  if (failure.isNewIn(record) &&
      failure.known.asText() != "KNAS_MM_PROC_FAILURE_CAUSE_REJECTED_BY_NW") {
    const std::string words = wordsOf(&failure.known, "cause");
    if (!words.empty()) {
      log.tellText(report, HappeningKind::registration, domain->technology,
                   std::string(domain->name) + ": failed, " + words);
    }
  }
}

}  // namespace qel

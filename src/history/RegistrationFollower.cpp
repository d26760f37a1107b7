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

// Whether the value is another one than known, which it then is.
bool isNew(const Value* value, Value& known) {
  if (!value || *value == known) return false;
  known = *value;
  return true;
}

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

void RegistrationFollower::follow(const Report& report, HappeningLog& log) {
  const auto domain = std::ranges::find(kDomains, report.metric, &Domain::metric);
  if (domain == kDomains.end()) return;
  Known& known = _known[static_cast<std::size_t>(domain - kDomains.begin())];
  const Dictionary& record = report.record;
  const Value* status = record.find("reg_status");
  if (isNew(status, known.status)) {
    log.tellText(report, HappeningKind::registration, domain->technology,
                 std::string(domain->name) + ": " + wordsOf(status, "status"));
  }
  const Value* reject = record.find("reject_cause");
  if (isNew(reject, known.reject)) {
    const std::string cause = causeText(*reject);
    if (!cause.empty()) {
      log.tellText(report, HappeningKind::reject, domain->technology,
                   rejectText(*domain, record, cause));
    }
  }
  // A rejected procedure has failed too: its cause has been told.
  const Value* failure = record.find("proc_failure_cause");
  if (isNew(failure, known.failure) &&
      failure->asText() != "KNAS_MM_PROC_FAILURE_CAUSE_REJECTED_BY_NW") {
    const std::string words = wordsOf(failure, "cause");
    if (!words.empty()) {
      log.tellText(report, HappeningKind::registration, domain->technology,
                   std::string(domain->name) + ": failed, " + words);
    }
  }
}

}  // namespace qel

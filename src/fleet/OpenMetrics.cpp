#include "fleet/OpenMetrics.h"

#include <prometheus/metric_family.h>
#include <prometheus/text_serializer.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <sstream>

#include "fleet/NumberNames.h"

namespace qel::fleet {
namespace {

using prometheus::ClientMetric;
using prometheus::MetricFamily;
using prometheus::MetricType;

constexpr std::string_view kOpenMetricsType = "application/openmetrics-text";
constexpr std::string_view kOpenMetricsVersion = "1.0.0";
constexpr std::string_view kPlainType = "text/plain";

std::string_view trimmed(std::string_view text) {
  const auto from = text.find_first_not_of(" \t");
  if (from == std::string_view::npos) return {};
  return text.substr(from, text.find_last_not_of(" \t") - from + 1);
}

// Cuts the text up to that sign off, or all of it.
std::string_view takeUntil(std::string_view& text, char sign) {
  const auto end = text.find(sign);
  const std::string_view part = text.substr(0, end);
  text = end == std::string_view::npos ? std::string_view() : text.substr(end + 1);
  return trimmed(part);
}

// One of the things that a client takes, and how much it likes it, from 0 to 1.
struct Taken {
  std::string_view type;
  std::string_view version;
  double liking = 1;
};

Taken takenIn(std::string_view part) {
  Taken taken{takeUntil(part, ';'), {}};
  while (!part.empty()) {
    std::string_view value = takeUntil(part, ';');
    const std::string_view key = takeUntil(value, '=');
    if (key == "version") taken.version = trimmed(value);
    if (key != "q") continue;
    const auto read = std::from_chars(value.data(), value.data() + value.size(), taken.liking);
    if (read.ec != std::errc()) taken.liking = 0;
  }
  return taken;
}

void addEscaped(std::string& out, std::string_view text) {
  for (const char c : text) {
    if (c == '\n') {
      out += "\\n";
      continue;
    }
    if (c == '\\' || c == '"') out += '\\';
    out += c;
  }
}

void addNumber(std::string& out, double value) {
  std::array<char, 64> text{};
  out.append(text.begin(), std::to_chars(text.begin(), text.end(), value).ptr);
}

void addSample(std::string& out, const std::string& name, const ClientMetric& metric,
               double value) {
  out += name;
  std::string_view between = "{";
  for (const ClientMetric::Label& label : metric.label) {
    ((out += between) += label.name) += "=\"";
    addEscaped(out, label.value);
    out += '"';
    between = ",";
  }
  if (!metric.label.empty()) out += '}';
  out += ' ';
  addNumber(out, value);
  out += '\n';
}

struct Kind {
  std::string_view type;
  std::string_view end;  // of the samples' names, beyond the family's
};

Kind kindOf(const MetricFamily& family) {
  if (family.type == MetricType::Counter) return {"counter", "_total"};
  if (family.name.ends_with("_info")) return {"info", "_info"};
  return {"gauge", ""};
}

void addFamily(std::string& out, const MetricFamily& family) {
  const Kind kind = kindOf(family);
  const auto length = family.name.size() - (family.name.ends_with(kind.end) ? kind.end.size() : 0);
  const std::string_view name = std::string_view(family.name).substr(0, length);
  ((((out += "# TYPE ") += name) += ' ') += kind.type) += '\n';
  if (const auto unit = baseUnitOf(name); kind.type == "gauge" && !unit.empty()) {
    ((((out += "# UNIT ") += name) += ' ') += unit) += '\n';
  }
  ((out += "# HELP ") += name) += ' ';
  addEscaped(out, family.help);
  out += '\n';
  for (const ClientMetric& metric : family.metric) {
    const bool isCounter = family.type == MetricType::Counter;
    addSample(out, family.name, metric, isCounter ? metric.counter.value : metric.gauge.value);
  }
}

}  // namespace

NumberText acceptedText(std::string_view accept) {
  if (trimmed(accept).empty()) return NumberText::openMetrics;
  double openMetrics = 0;
  double plain = 0;
  const auto likeMore = [](double& liking, double more) { liking = std::max(liking, more); };
  while (!accept.empty()) {
    const Taken taken = takenIn(takeUntil(accept, ','));
    const bool isKnown = taken.version.empty() || taken.version == kOpenMetricsVersion;
    if (taken.type == kOpenMetricsType && isKnown) likeMore(openMetrics, taken.liking);
    if (taken.type == kPlainType || taken.type == "text/*") likeMore(plain, taken.liking);
    if (taken.type == "*/*" || taken.type == "application/*") likeMore(openMetrics, taken.liking);
  }
  return plain > openMetrics ? NumberText::plain : NumberText::openMetrics;
}

std::string_view contentType(NumberText form) {
  return form == NumberText::openMetrics
             ? "application/openmetrics-text; version=1.0.0; charset=utf-8"
             : "text/plain; version=0.0.4; charset=utf-8";
}

std::string numberText(const std::vector<MetricFamily>& families, NumberText form) {
  if (form == NumberText::plain) {
    std::ostringstream out;
    prometheus::TextSerializer().Serialize(out, families);
    return out.str();
  }
  std::string out;
  for (const MetricFamily& family : families) addFamily(out, family);
  return out + "# EOF\n";
}

}  // namespace qel::fleet

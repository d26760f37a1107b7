// The metrics that a modem of ModemManager has values for, from the picture of it.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "base/Bytes.h"
#include "sources/MetricKeeper.h"
#include "sources/modem_manager/ModemPicture.h"

namespace qel::sources {

// A payload with that time stamp; nothing when the modem does not give it.
using BuildModemReport = std::optional<Bytes> (*)(const ModemPicture& modem, std::uint64_t timeMs);

struct ModemReportRow {
  std::uint32_t metric;  // 16 bits
  BuildModemReport build;
};

std::span<const ModemReportRow> modemReports();

// The same, for a keeper. The builder is for as long as the picture is there.
std::vector<MetricKeeper::Row> keptModemReports();
MetricKeeper::Build modemReportBuilder(const ModemPicture& modem);

std::optional<Bytes> modemLteCell(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemLteMeasurement(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemLteQuality(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemLteCarriers(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemLteNeighbours(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemLteOthers(const ModemPicture& modem, std::uint64_t timeMs);

std::optional<Bytes> modemUmtsCell(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemUmtsMeasurement(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemUmtsNeighbours(const ModemPicture& modem, std::uint64_t timeMs);

std::optional<Bytes> modemGsmCell(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemGsmMeasurement(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemGsmNeighbours(const ModemPicture& modem, std::uint64_t timeMs);

std::optional<Bytes> modemEmmContext(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemMmContext(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemGmmContext(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemMmCommonInfo(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemBearers(const ModemPicture& modem, std::uint64_t timeMs);
std::optional<Bytes> modemSimFiles(const ModemPicture& modem, std::uint64_t timeMs);

}  // namespace qel::sources

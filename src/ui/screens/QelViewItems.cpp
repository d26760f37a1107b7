#include "ui/screens/QelViewItems.h"

#include <array>
#include <span>
#include <string_view>

namespace qel {
namespace {

constexpr std::array<std::string_view, 3> kDeviceInfo = {"IMSI", "IMEISV", "SIM Files"};

constexpr std::array<std::string_view, 13> kLTE = {
    "NAS",
    "RRC State",
    "Serving Cell Info",
    "Serving Cell Meas",
    "Tx Power",
    "Sel Resel Parameters",
    "EUTRA Neighbor Info",
    "C-DRX",
    "LTE Neighbor Cell Meas",
    "UMTS Neighbor Cell Meas",
    "GSM Neighbor Cell Meas",
    "CA Status",
    "Active Bearers",
};

constexpr std::array<std::string_view, 15> kUMTS = {
    "NAS GMM",
    "NAS MM",
    "RRC State",
    "RRC Configuration",
    "Serving Cell Info",
    "Serving Cell Meas",
    "Tx Power",
    "Sel Resel Parameters",
    "EUTRA Neighbor Info",
    "UTRA Neighbor Info",
    "GSM Neighbor Info",
    "LTE Neighbor Cell Meas",
    "UMTS Neighbor Cell Meas",
    "GSM Neighbor Cell Meas",
    "Active Bearers",
};

constexpr std::array<std::string_view, 11> kGSM = {
    "NAS GMM",
    "NAS MM",
    "Serving Cell Info",
    "Idle Config",
    "Idle Serv Cell Meas",
    "Connected Serv Cell Meas",
    "GSM GPRS Config",
    "LTE Neighbor Cell Meas",
    "UMTS Neighbor Cell Meas",
    "GSM Neighbor Cell Meas",
    "Active Bearers",
};

struct Technology {
  std::string_view name;
  std::span<const std::string_view> categories;
};

constexpr std::array<Technology, 4> kTechnologies = {{
    {"Device Info", kDeviceInfo},
    {"LTE", kLTE},
    {"UMTS", kUMTS},
    {"GSM", kGSM},
}};

}  // namespace

QelViewItems::QelViewItems() {
  for (const Technology& technology : kTechnologies) {
    launchViewItemNames.emplace_back(technology.name);
    firstLevelViewItems.try_emplace(std::string(technology.name), technology.categories.begin(),
                                    technology.categories.end());
  }
}

const QelViewItems& QelViewItems::shared() {
  static const auto& items = *new QelViewItems;  // screens may outlast the end of the process
  return items;
}

}  // namespace qel

#include "rrc/Tshark.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>

#include "support/Subprocess.h"

namespace qel::testing {
namespace {

void put32(std::string& out, std::uint32_t value) {  // the low byte first
  for (unsigned i = 0; i < 4; ++i) out += static_cast<char>(value >> (8 * i));
}

void put16(std::string& out, std::size_t value) {  // the high byte first
  out += static_cast<char>(value >> 8);
  out += static_cast<char>(value);
}

// A capture file of messages without any transport, each with its dissector's name in front.
std::string captureOf(const std::vector<JudgedMessage>& messages) {
  constexpr std::uint32_t kMagic = 0xA1B2C3D4;
  constexpr std::uint32_t kExportedMessages = 252;
  constexpr std::size_t kDissectorName = 12;
  std::string file;
  for (const std::uint32_t word : {kMagic, 0x00040002U, 0U, 0U, 0x40000U, kExportedMessages}) {
    put32(file, word);
  }
  for (const JudgedMessage& message : messages) {
    std::string name = message.dissector;
    name.resize((name.size() + 3) / 4 * 4);
    std::string packet;
    put16(packet, kDissectorName);
    put16(packet, name.size());
    packet += name;
    put32(packet, 0);
    packet.append(reinterpret_cast<const char*>(message.pdu.data()), message.pdu.size());
    put32(file, 0);
    put32(file, 0);
    put32(file, static_cast<std::uint32_t>(packet.size()));
    put32(file, static_cast<std::uint32_t>(packet.size()));
    file += packet;
  }
  return file;
}

// What RRC messages carry; random bytes are none of these.
constexpr std::array kCarried = {"nas-eps",    "nas-5gs",    "nr-rrc",     "lte_rrc",
                                 "rrc",        "gsm_a.dtap", "gsm_a.ccch", "gsm_a.sacch",
                                 "gsm_rlcmac", "gsm_a.rp",   "lpp",        "cdma2k"};

// The value of one attribute of a line of PDML.
std::string attribute(const std::string& line, const std::string& name) {
  const std::string opening = " " + name + "=\"";
  const auto start = line.find(opening);
  if (start == std::string::npos) return {};
  const auto from = start + opening.size();
  return line.substr(from, line.find('"', from) - from);
}

// lte-rrc.schedulingRequestConfig.setup_element is setup.
std::string fieldName(std::string name) {
  name.erase(0, name.rfind('.') + 1);
  std::replace(name.begin(), name.end(), '_', '-');
  constexpr std::string_view kElement = "-element";
  if (name.ends_with(kElement)) name.resize(name.size() - kElement.size());
  return name;
}

// "c1: systemInformation (0)" is systemInformation.
std::string label(const std::string& shown) {
  const auto from = shown.find(": ");
  const auto to = shown.rfind(" (");
  if (from == std::string::npos || to == std::string::npos || to < from) return {};
  return shown.substr(from + 2, to - from - 2);
}

class Reader {
 public:
  explicit Reader(std::string prefix) : _prefix(std::move(prefix)) {}

  void line(const std::string& line) {
    if (line.find("<packet>") != std::string::npos) {
      messages.emplace_back();
      _path.clear();
    } else if (line.find("<field ") != std::string::npos) {
      field(line);
    } else if (line.find("</field>") != std::string::npos && !_path.empty()) {
      _path.pop_back();
    }
  }

  std::vector<std::vector<Shown>> messages;

 private:
  void field(const std::string& line) {
    const std::string name = attribute(line, "name");
    const bool ours = name.starts_with(_prefix) && !line.ends_with(" hide=\"yes\"/>");
    std::string value = attribute(line, "show");
    value.erase(std::remove(value.begin(), value.end(), ':'), value.end());
    if (ours && !name.ends_with("_element") && !messages.empty()) {
      messages.back().push_back(
          {fieldName(name), value, label(attribute(line, "showname")), _path});
    }
    if (!line.ends_with("/>")) _path.push_back(ours ? fieldName(name) : std::string());
  }

  std::string _prefix;
  std::vector<std::string> _path;
};

std::string pathOfTshark() {
  const char* path = std::getenv("PATH");
  std::istringstream folders(path != nullptr ? path : "");
  for (std::string folder; std::getline(folders, folder, ':');) {
    const std::string program = folder + "/tshark";
    if (access(program.c_str(), X_OK) == 0) return program;
  }
  return {};
}

}  // namespace

bool hasTshark() { return !pathOfTshark().empty(); }

std::vector<std::vector<Shown>> shownByTshark(const std::vector<JudgedMessage>& messages,
                                              const std::string& protocol,
                                              const std::string& prefix) {
  const std::filesystem::path path =
      std::filesystem::path(::testing::TempDir()) / ("rrc-" + std::to_string(getpid()) + ".pcap");
  std::ofstream(path, std::ios::binary) << captureOf(messages);
  std::vector<std::string> arguments = {"-r", path.string(), "-T", "pdml"};
  for (const char* carried : kCarried) {
    if (carried == protocol) continue;
    arguments.insert(arguments.end(), {"--disable-protocol", carried});
  }
  const Outcome outcome = run(pathOfTshark(), arguments);
  std::filesystem::remove(path);
  EXPECT_EQ(outcome.exitCode, 0) << outcome.err;
  Reader reader(prefix);
  std::istringstream lines(outcome.out);
  for (std::string line; std::getline(lines, line);) reader.line(line);
  EXPECT_EQ(reader.messages.size(), messages.size());
  reader.messages.resize(messages.size());
  return std::move(reader.messages);
}

}  // namespace qel::testing

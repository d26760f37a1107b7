#include "sources/modem_manager/AtSimulator.h"

#include <poll.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <stdexcept>
#include <string_view>
#include <utility>

namespace qel::testing {
namespace {

constexpr std::size_t kPorts = 2;

std::string hex(std::uint32_t value, int digits) {
  std::array<char, 16> text{};
  std::snprintf(text.data(), text.size(), "%0*X", digits, value);
  return text.data();
}

std::string quoted(const std::string& text) { return '"' + text + '"'; }

// Of an elementary file with digits, two in a byte and the first one low; `text` is even.
std::string swapped(std::string text) {
  for (std::size_t i = 0; i + 1 < text.size(); i += 2) std::swap(text[i], text[i + 1]);
  return text;
}

bool isOnLte(const AtModem& modem) { return modem.technology == 7; }

// Which of the three registrations speaks for the technology in use.
bool speaks(const AtModem& modem, const std::string& name) {
  return isOnLte(modem) ? name == "+CEREG" : name != "+CEREG";
}

// Behind the mode of an answer, or alone when it is told unasked.
std::string registration(const AtModem& modem, const std::string& name) {
  if (!speaks(modem, name)) return "0";
  std::string text = std::to_string(modem.registration);
  if (modem.registration != 1 && modem.registration != 5) return text;
  return text + ',' + quoted(hex(modem.area, 4)) + ',' + quoted(hex(modem.cellId, 8)) + ',' +
         std::to_string(modem.technology);
}

std::string signalQuality(const AtModem& modem) {
  const std::string levels =
      isOnLte(modem) ? std::to_string(modem.rsrq) + ',' + std::to_string(modem.rsrp) : "255,255";
  return "+CESQ: 99,99,255,255," + levels;
}

using Answer = std::string (*)(const AtModem& modem);

struct CommandRow {
  const char* command;
  Answer answer;
};

// What is not here is answered by a plain "OK" when it sets something, and else by "ERROR".
constexpr std::array kCommands = {
    CommandRow{"+GCAP", [](const AtModem&) { return std::string("+GCAP: +CGSM,+CLTE1"); }},
    CommandRow{"+CGMI", [](const AtModem&) { return std::string("Simulated"); }},
    CommandRow{"+CGMM", [](const AtModem&) { return std::string("AT"); }},
    CommandRow{"+CGMR", [](const AtModem&) { return std::string("1"); }},
    CommandRow{"+CGSN", [](const AtModem& modem) { return modem.imei; }},
    CommandRow{"+CIMI", [](const AtModem& modem) { return modem.imsi; }},
    CommandRow{"+CPIN?", [](const AtModem&) { return std::string("+CPIN: READY"); }},
    CommandRow{"+CFUN?", [](const AtModem&) { return std::string("+CFUN: 1"); }},
    CommandRow{"+CSCS=?", [](const AtModem&) { return std::string("+CSCS: (\"IRA\",\"UCS2\")"); }},
    CommandRow{"+WS46=?", [](const AtModem&) { return std::string("+WS46: (12,22,25,28,29)"); }},
    CommandRow{"+CIND=?", [](const AtModem&) { return std::string("+CIND: (\"signal\",(0-5))"); }},
    CommandRow{"+CIND?", [](const AtModem&) { return std::string("+CIND: 4"); }},
    CommandRow{"+CSQ", [](const AtModem&) { return std::string("+CSQ: 20,99"); }},
    CommandRow{"+CESQ", signalQuality},
    CommandRow{"+CESQ=?",
               [](const AtModem&) {
                 return std::string(
                     "+CESQ: (0-63,99),(0-7,99),(0-96,255),(0-49,255),(0-34,255),"
                     "(0-97,255)");
               }},
    CommandRow{"+COPS?",
               [](const AtModem& modem) {
                 return "+COPS: 0,2," + quoted(modem.operatorCode) + ',' +
                        std::to_string(modem.technology);
               }},
    CommandRow{"+CGDCONT=?",
               [](const AtModem&) {
                 return std::string(
                     "+CGDCONT: (1-4),\"IP\",,,(0),(0)\r\n"
                     "+CGDCONT: (1-4),\"IPV6\",,,(0),(0)");
               }},
    CommandRow{"+CGACT?", [](const AtModem&) { return std::string("+CGACT: 1,0"); }},
    CommandRow{"+CGATT?", [](const AtModem&) { return std::string("+CGATT: 1"); }},
    // The files of the card: its number, how long the network's code is (31.102, clause 4.2.18),
    // the provider's name and the emergency numbers (51.011, clauses 10.3.11 and 10.3.27).
    CommandRow{
        "+CRSM=176,12258,0,0,10",
        [](const AtModem& modem) { return "+CRSM: 144,0," + quoted(swapped(modem.iccid + 'F')); }},
    CommandRow{"+CRSM=176,28589,0,0,4",
               [](const AtModem&) { return std::string("+CRSM: 144,0,\"00000002\""); }},
    CommandRow{"+CRSM=176,28486,0,0,17",
               [](const AtModem&) {
                 return std::string("+CRSM: 144,0,\"0154657374204E6574FFFFFFFFFFFFFFFF\"");
               }},
    CommandRow{"+CRSM=176,28599,0,0,15",
               [](const AtModem&) {
                 return std::string("+CRSM: 144,0,\"11F2FF19F1FFFFFFFFFFFFFFFFFFFF\"");
               }},
};

}  // namespace

AtSimulator::AtSimulator(AtModem modem) : _modem(std::move(modem)) {
  static std::atomic<int> made = 0;
  const std::string name =
      "abstract:qel" + std::to_string(::getpid()) + '-' + std::to_string(++made) + '-';
  for (std::size_t i = 0; i < kPorts; ++i) {
    _ports.push_back(name + std::to_string(i));
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::memcpy(address.sun_path + 1, _ports[i].data(), _ports[i].size());
    const int listener = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const auto size = static_cast<socklen_t>(sizeof address.sun_family + 1 + _ports[i].size());
    if (::bind(listener, reinterpret_cast<const sockaddr*>(&address), size) != 0 ||
        ::listen(listener, 4) != 0) {
      throw std::runtime_error("no socket for the simulated modem");
    }
    _listeners.push_back(listener);
  }
  _thread = std::thread([this] { live(); });
}

AtSimulator::~AtSimulator() {
  _stopping = true;
  _wakeUp.signal();
  _thread.join();
  for (const int listener : _listeners) ::close(listener);
  for (const Line& line : _lines) ::close(line.descriptor);
}

void AtSimulator::change(const std::function<void(AtModem&)>& edit) {
  const std::lock_guard lock(_mutex);
  const AtModem before = _modem;
  edit(_modem);
  for (const char* name : {"+CREG", "+CGREG", "+CEREG"}) {
    const std::string now = registration(_modem, name);
    if (now != registration(before, name)) _unasked.push_back(std::string(name) + ": " + now);
  }
  _wakeUp.signal();
}

std::vector<std::string> AtSimulator::unknownCommands() const {
  const std::lock_guard lock(_mutex);
  return _unknown;
}

void AtSimulator::live() {
  while (!_stopping) {
    std::vector<pollfd> waited = {{_wakeUp.descriptor(), POLLIN, 0}};
    for (const int listener : _listeners) waited.push_back({listener, POLLIN, 0});
    for (const Line& line : _lines) waited.push_back({line.descriptor, POLLIN, 0});
    ::poll(waited.data(), waited.size(), -1);
    _wakeUp.clear();
    std::vector<std::string> unasked;
    {
      const std::lock_guard lock(_mutex);
      unasked.swap(_unasked);
    }
    for (const std::string& text : unasked) {
      for (const Line& line : _lines) {
        if (!line.dataMode) send(line, "\r\n" + text + "\r\n");
      }
    }
    // From behind, so that a line that ends moves no other before its turn.
    for (std::size_t i = _lines.size(); i-- > 0;) {
      if (waited[1 + _listeners.size() + i].revents == 0 || receive(_lines[i])) continue;
      ::close(_lines[i].descriptor);
      _lines.erase(_lines.begin() + static_cast<std::ptrdiff_t>(i));
    }
    for (std::size_t i = 0; i < _listeners.size(); ++i) {
      if (waited[1 + i].revents != 0) accept(_listeners[i]);
    }
  }
}

void AtSimulator::accept(int listener) {
  const int descriptor = ::accept4(listener, nullptr, nullptr, SOCK_CLOEXEC);
  if (descriptor >= 0) _lines.push_back({descriptor, {}});
}

bool AtSimulator::receive(Line& line) {
  std::array<char, 512> part{};
  const ssize_t count = ::recv(line.descriptor, part.data(), part.size(), 0);
  if (count <= 0) return false;
  line.received.append(part.data(), static_cast<std::size_t>(count));
  for (auto end = line.received.find_first_of("\r\n"); end != std::string::npos;
       end = line.received.find_first_of("\r\n")) {
    std::string command = line.received.substr(0, end);
    line.received.erase(0, end + 1);
    if (command.size() < 2 || line.dataMode) continue;
    command.erase(0, 2);  // "AT"
    send(line, answer(line, command));
  }
  return true;
}

std::string AtSimulator::answer(Line& line, const std::string& command) {
  const std::lock_guard lock(_mutex);
  if (command.starts_with("D")) {
    line.dataMode = true;
    return "\r\nCONNECT\r\n";
  }
  for (const char* name : {"+CREG", "+CGREG", "+CEREG"}) {
    if (command == std::string(name) + '?') {
      return "\r\n" + std::string(name) + ": 2," + registration(_modem, name) + "\r\n\r\nOK\r\n";
    }
  }
  constexpr std::string_view kDefine = "+CGDCONT=";
  if (command.starts_with(kDefine) && command.find('?') == std::string::npos) {
    _contexts[command.substr(kDefine.size(), 1)] = command.substr(kDefine.size());
    return "\r\nOK\r\n";
  }
  if (command == "+CGDCONT?") {
    std::string contexts;
    for (const auto& [identifier, context] : _contexts) {
      contexts += "\r\n+CGDCONT: " + context + ",\"\",0,0\r\n";
    }
    return contexts + "\r\nOK\r\n";
  }
  const auto row = std::ranges::find_if(
      kCommands, [&](const CommandRow& known) { return command == known.command; });
  if (row != kCommands.end()) return "\r\n" + row->answer(_modem) + "\r\n\r\nOK\r\n";
  const bool asks = command.ends_with('?') || command.starts_with("+CRSM");
  const bool sets = !asks && command.find('=') != std::string::npos;
  if (sets || !command.starts_with('+')) return "\r\nOK\r\n";
  _unknown.push_back(command);
  return "\r\nERROR\r\n";
}

void AtSimulator::send(const Line& line, const std::string& text) {
  // Whoever is gone is noticed when it is read from.
  static_cast<void>(::send(line.descriptor, text.data(), text.size(), MSG_NOSIGNAL));
}

}  // namespace qel::testing

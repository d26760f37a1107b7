#include "sources/modem_manager/RealModemManager.h"

#include <fcntl.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <stdexcept>
#include <thread>

namespace qel::testing {
namespace {

using namespace std::chrono_literals;

constexpr const char* kService = "org.freedesktop.ModemManager1";
constexpr const char* kRoot = "/org/freedesktop/ModemManager1";
constexpr auto kPatience = 60s;

using Objects =
    std::map<sdbus::ObjectPath, std::map<std::string, std::map<std::string, sdbus::Variant>>>;

}  // namespace

bool RealModemManager::isInstalled() { return ::access(kProgram, X_OK) == 0; }

RealModemManager::RealModemManager(const PrivateBus& bus)
    : _address(bus.address()), _connection(sdbus::createSessionBusConnectionWithAddress(_address)) {
  start();
}

RealModemManager::~RealModemManager() { kill(); }

void RealModemManager::start() {
  std::array<std::string, 7> words = {
      kProgram,         "--test-session",           "--test-enable", "--no-auto-scan",
      "--test-no-udev", "--test-no-suspend-resume", "--test-no-qrtr"};
  std::array<std::string, 2> settings = {
      "DBUS_SESSION_BUS_ADDRESS=" + _address,
      // Keeps it from the machine's own bus. On a session bus everyone may do everything.
      "DBUS_SYSTEM_BUS_ADDRESS=unix:path=/nonexistent"};
  std::array<char*, words.size() + 1> argv{};
  std::array<char*, settings.size() + 1> environment{};
  for (std::size_t i = 0; i < words.size(); ++i) argv[i] = words[i].data();
  for (std::size_t i = 0; i < settings.size(); ++i) environment[i] = settings[i].data();
  const pid_t parent = ::getpid();
  _pid = ::fork();
  if (_pid == 0) {
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    if (::getppid() != parent) ::_exit(1);
    if (!std::getenv("QEL_SHOW_MODEM_MANAGER")) {
      const int nowhere = ::open("/dev/null", O_RDWR);
      for (const int stream : {0, 1, 2}) ::dup2(nowhere, stream);
    }
    ::execve(kProgram, argv.data(), environment.data());
    ::_exit(127);
  }
  if (_pid < 0) throw std::runtime_error("ModemManager cannot be run");
  const auto bus =
      sdbus::createProxy(*_connection, "org.freedesktop.DBus", "/org/freedesktop/DBus");
  const auto end = std::chrono::steady_clock::now() + kPatience;
  for (bool there = false; !there; std::this_thread::sleep_for(20ms)) {
    bus->callMethod("NameHasOwner")
        .onInterface("org.freedesktop.DBus")
        .withArguments(std::string(kService))
        .storeResultsTo(there);
    if (!there && std::chrono::steady_clock::now() > end) {
      throw std::runtime_error("ModemManager does not start");
    }
  }
}

void RealModemManager::kill() {
  if (_pid == 0) return;
  ::kill(_pid, SIGKILL);
  ::waitpid(_pid, nullptr, 0);
  _pid = 0;
}

std::unique_ptr<sdbus::IProxy> RealModemManager::proxy(const std::string& path) {
  return sdbus::createProxy(*_connection, kService, path);
}

std::string RealModemManager::plugIn(const AtSimulator& modem) {
  proxy(kRoot)
      ->callMethod("SetProfile")
      .onInterface("org.freedesktop.ModemManager1.Test")
      .withTimeout(kPatience)
      .withArguments(std::string("simulated"), std::string("generic"), modem.ports());
  const auto end = std::chrono::steady_clock::now() + kPatience;
  while (std::chrono::steady_clock::now() < end) {
    Objects objects;
    proxy(kRoot)
        ->callMethod("GetManagedObjects")
        .onInterface("org.freedesktop.DBus.ObjectManager")
        .storeResultsTo(objects);
    if (!objects.empty()) return objects.begin()->first;
    std::this_thread::sleep_for(20ms);
  }
  throw std::runtime_error("ModemManager shows no modem");
}

void RealModemManager::enable(const std::string& modem, bool on) {
  proxy(modem)
      ->callMethod("Enable")
      .onInterface("org.freedesktop.ModemManager1.Modem")
      .withTimeout(kPatience)
      .withArguments(on);
}

void RealModemManager::connect(const std::string& modem, const std::string& apn) {
  sdbus::ObjectPath bearer;
  proxy(modem)
      ->callMethod("Connect")
      .onInterface("org.freedesktop.ModemManager1.Modem.Simple")
      .withTimeout(kPatience)
      .withArguments(std::map<std::string, sdbus::Variant>{{"apn", sdbus::Variant(apn)}})
      .storeResultsTo(bearer);
}

void RealModemManager::disconnect(const std::string& modem) {
  // This path stands for every connection.
  proxy(modem)
      ->callMethod("Disconnect")
      .onInterface("org.freedesktop.ModemManager1.Modem.Simple")
      .withTimeout(kPatience)
      .withArguments(sdbus::ObjectPath("/"));
}

void RealModemManager::setUpLocation(const std::string& modem, std::uint32_t sources,
                                     bool signals) {
  proxy(modem)
      ->callMethod("Setup")
      .onInterface("org.freedesktop.ModemManager1.Modem.Location")
      .withTimeout(kPatience)
      .withArguments(sources, signals);
}

}  // namespace qel::testing

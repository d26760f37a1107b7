#include <fcntl.h>
#include <libudev.h>
#include <sys/inotify.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <memory>

#include "sources/diagnostics/port/Descriptor.h"
#include "sources/diagnostics/port/PortSearch.h"

namespace qel::diagnostics {
namespace {

constexpr std::size_t kMostPorts = 16;

struct Unreference {
  void operator()(udev* context) const { udev_unref(context); }
  void operator()(udev_enumerate* list) const { udev_enumerate_unref(list); }
  void operator()(udev_device* device) const { udev_device_unref(device); }
};
using Context = std::unique_ptr<udev, Unreference>;
using List = std::unique_ptr<udev_enumerate, Unreference>;
using Device = std::unique_ptr<udev_device, Unreference>;

std::string textOf(const char* text) { return text != nullptr ? text : ""; }

// The device that all ports of a modem hang on: on USB that of the bus, else the nearest of PCI.
std::string modemAbove(udev_device* port) {
  udev_device* modem = udev_device_get_parent_with_subsystem_devtype(port, "usb", "usb_device");
  if (modem == nullptr) modem = udev_device_get_parent_with_subsystem_devtype(port, "pci", nullptr);
  return modem != nullptr ? textOf(udev_device_get_syspath(modem)) : "";
}

class UdevPortSearch final : public PortSearch {
 public:
  UdevPortSearch() : _udev(udev_new()), _changes(::inotify_init1(IN_NONBLOCK | IN_CLOEXEC)) {
    if (!_changes) return;
    // Nodes come and go in the one; in the other udev notes what it knows, once rights are set. Its
    // own messages do not reach a service that has no network.
    ::inotify_add_watch(_changes.number(), "/dev", IN_CREATE | IN_ATTRIB | IN_ONLYDIR);
    ::inotify_add_watch(_changes.number(), "/run/udev/data", IN_MOVED_TO | IN_ONLYDIR);
  }

  std::vector<FoundPort> ports() override {
    std::vector<FoundPort> found;
    if (_udev) {
      find(found, "tty", [](udev_enumerate* list) {
        udev_enumerate_add_match_property(list, "ID_MM_PORT_TYPE_QCDM", "1");
      });
      find(found, "wwan",
           [](udev_enumerate* list) { udev_enumerate_add_match_sysattr(list, "type", "QCDM"); });
    }
    found.push_back({"@diag", ""});
    return found;
  }

  std::string modemOf(const std::string& address) override {
    struct stat status {};
    if (!_udev || ::stat(address.c_str(), &status) != 0 || !S_ISCHR(status.st_mode)) return "";
    const Device port(udev_device_new_from_devnum(_udev.get(), 'c', status.st_rdev));
    return port ? modemAbove(port.get()) : "";
  }

  int descriptor() const override { return _changes.number(); }

  void clear() override {
    std::array<char, 4096> events;
    while (_changes && ::read(_changes.number(), events.data(), events.size()) > 0) {
    }
  }

 private:
  template <class Narrow>
  void find(std::vector<FoundPort>& found, const char* subsystem, const Narrow& narrow) {
    const List list(udev_enumerate_new(_udev.get()));
    if (!list) return;
    udev_enumerate_add_match_subsystem(list.get(), subsystem);
    narrow(list.get());
    udev_enumerate_scan_devices(list.get());
    for (auto* entry = udev_enumerate_get_list_entry(list.get());
         entry != nullptr && found.size() < kMostPorts; entry = udev_list_entry_get_next(entry)) {
      const Device port(udev_device_new_from_syspath(_udev.get(), udev_list_entry_get_name(entry)));
      if (!port) continue;
      const std::string node = textOf(udev_device_get_devnode(port.get()));
      if (!node.empty()) found.push_back({node, modemAbove(port.get())});
    }
  }

  Context _udev;
  Descriptor _changes;
};

}  // namespace

std::unique_ptr<PortSearch> makeUdevPortSearch() { return std::make_unique<UdevPortSearch>(); }

}  // namespace qel::diagnostics

#include "app/Display.h"

#include <sys/stat.h>
#include <unistd.h>

#include <QtCore/QByteArray>
#include <QtCore/QDir>
#include <QtGui/QGuiApplication>
#include <QtGui/QScreen>
#include <algorithm>
#include <array>
#include <cstdlib>
#include <filesystem>
#include <system_error>

namespace qel {
namespace {

constexpr auto kPlatformVariable = "QT_QPA_PLATFORM";
constexpr auto kSessionVariable = "XDG_RUNTIME_DIR";
constexpr std::array kDisplayVariables = {"WAYLAND_DISPLAY", "DISPLAY", kPlatformVariable};

// No link either: its owner could turn it elsewhere.
bool isOwnAndClosed(const std::string& folder) {
  struct stat about {};
  return ::lstat(folder.c_str(), &about) == 0 && S_ISDIR(about.st_mode) &&
         about.st_uid == ::getuid() && (about.st_mode & (S_IRWXG | S_IRWXO)) == 0;
}

}  // namespace

bool hasDisplay() {
  return std::any_of(kDisplayVariables.begin(), kDisplayVariables.end(),
                     [](const char* name) { return !qEnvironmentVariableIsEmpty(name); });
}

void useMemoryAsDisplay() { qputenv(kPlatformVariable, QByteArrayLiteral("offscreen")); }

void useNoInputMethod() { qputenv("QT_IM_MODULE", QByteArrayLiteral("none")); }

bool isOnPhone() {
  constexpr int kWidestPhone = 600;  // of its shorter side, in points
  const QScreen* screen = QGuiApplication::primaryScreen();
  if (!screen || !QGuiApplication::platformName().startsWith(u"wayland")) return false;
  return std::min(screen->size().width(), screen->size().height()) < kWidestPhone;
}

SessionFolder::SessionFolder() {
  if (!qEnvironmentVariableIsEmpty(kSessionVariable)) return;
  const std::string temporary = QDir::tempPath().toStdString();
  std::string folder = temporary + "/runtime-" + std::to_string(::getuid());
  ::mkdir(folder.c_str(), S_IRWXU);
  if (!isOwnAndClosed(folder)) {
    _made = temporary + "/qelwatch-XXXXXX";
    if (!::mkdtemp(_made.data())) _made.clear();
    folder = _made;
  }
  if (!folder.empty()) qputenv(kSessionVariable, QByteArray::fromStdString(folder));
}

SessionFolder::~SessionFolder() {
  std::error_code error;
  if (!_made.empty()) std::filesystem::remove_all(_made, error);
}

}  // namespace qel

#include "app/Display.h"

#include <unistd.h>

#include <QtCore/QByteArray>
#include <QtCore/QDir>
#include <algorithm>
#include <array>

namespace qel {
namespace {

constexpr auto kPlatformVariable = "QT_QPA_PLATFORM";
constexpr auto kSessionVariable = "XDG_RUNTIME_DIR";
constexpr std::array kDisplayVariables = {"WAYLAND_DISPLAY", "DISPLAY", kPlatformVariable};

}  // namespace

bool hasDisplay() {
  return std::any_of(kDisplayVariables.begin(), kDisplayVariables.end(),
                     [](const char* name) { return !qEnvironmentVariableIsEmpty(name); });
}

void useMemoryAsDisplay() { qputenv(kPlatformVariable, QByteArrayLiteral("offscreen")); }

void provideSessionFolder() {
  if (!qEnvironmentVariableIsEmpty(kSessionVariable)) return;
  const QString user = QString::number(::getuid());
  qputenv(kSessionVariable, (QDir::tempPath() + "/runtime-" + user).toLocal8Bit());
}

}  // namespace qel

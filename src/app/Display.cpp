#include "app/Display.h"

#include <QtCore/QByteArray>
#include <algorithm>
#include <array>

namespace qel {
namespace {

constexpr auto kPlatformVariable = "QT_QPA_PLATFORM";
constexpr std::array kDisplayVariables = {"WAYLAND_DISPLAY", "DISPLAY", kPlatformVariable};

}  // namespace

bool hasDisplay() {
  return std::any_of(kDisplayVariables.begin(), kDisplayVariables.end(),
                     [](const char* name) { return !qEnvironmentVariableIsEmpty(name); });
}

void useMemoryAsDisplay() { qputenv(kPlatformVariable, QByteArrayLiteral("offscreen")); }

}  // namespace qel

// The texts of a page as the window takes them.
#pragma once

#include <QtCore/QString>
#include <string>
#include <string_view>

namespace qel {

inline QString shown(std::string_view text) {
  return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

}  // namespace qel

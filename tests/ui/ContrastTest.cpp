// Whether what is written can be read, in sunlight too.

#include <gtest/gtest.h>

#include <QtGui/QColor>
#include <QtQml/QQmlComponent>
#include <QtQml/QQmlEngine>
#include <cmath>

#include "ui/Window.h"

namespace qel {
namespace {

using testing::Window;

double linear(double part) {
  return part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
}

double luminance(const QColor& color) {
  return 0.2126 * linear(color.redF()) + 0.7152 * linear(color.greenF()) +
         0.0722 * linear(color.blueF());
}

double contrast(const QColor& a, const QColor& b) {
  const auto [low, high] = std::minmax({luminance(a), luminance(b)});
  return (high + 0.05) / (low + 0.05);
}

class Contrast : public ::testing::TestWithParam<Appearance::Theme> {
 protected:
  Contrast() { window.appearance().overrideTheme(GetParam()); }

  QColor color(const char* role) const {
    QQmlComponent component(qmlEngine(&window.navigation()));
    component.setData(QByteArray("import QtQuick\nimport Qelwatch.Ui\nItem { property color c: "
                                 "Theme.") +
                          role + " }",
                      QUrl());
    const std::unique_ptr<QObject> item(component.create());
    return item ? item->property("c").value<QColor>() : QColor();
  }

  Window window;
};

TEST_P(Contrast, valuesStandOutSevenfold) {
  for (const char* ground : {"row", "page"}) {
    EXPECT_GE(contrast(color("value"), color(ground)), 7) << ground;
    EXPECT_GE(contrast(color("accent"), color(ground)), 4.5) << ground;
  }
  EXPECT_GE(contrast(color("secondary"), color("row")), 7);
  EXPECT_GE(contrast(color("secondary"), color("page")), 4.5);
  EXPECT_GE(contrast(color("noticeText"), color("noticeGround")), 7);
  EXPECT_GE(contrast(color("error"), color("row")), 7);
}

TEST_P(Contrast, wordsOfQualityCanBeReadAndToldApart) {
  for (const char* grade : {"good", "fair", "poor"}) {
    for (const char* ground : {"row", "page"}) {
      EXPECT_GE(contrast(color(grade), color(ground)), 4.5) << grade << " on " << ground;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Themes, Contrast, ::testing::Values(Appearance::Light, Appearance::Dark));

}  // namespace
}  // namespace qel

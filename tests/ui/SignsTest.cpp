// Whether the small drawn signs can be told apart, without colour and as small as they are.

#include "ui/quick/pages/Signs.h"

#include <gtest/gtest.h>

#include <QtGui/QImage>
#include <algorithm>
#include <numeric>
#include <string_view>
#include <vector>

#include "history/Happening.h"

namespace qel {
namespace {

constexpr int kSide = 16;  // pixels
using Ink = std::vector<int>;

// How dark each pixel is of a picture that is wider than its sign by a margin.
Ink inkOf(std::string_view name, int margin = 0) {
  QImage image(kSide + 2 * margin, kSide + 2 * margin, QImage::Format_Grayscale8);
  image.fill(Qt::white);
  QPainter painter(&image);
  const QString text = QString::fromUtf8(name.data(), static_cast<qsizetype>(name.size()));
  if (!drawSign(painter, QRectF(margin, margin, kSide, kSide), text, Qt::black)) return {};
  painter.end();
  Ink ink;
  for (int y = 0; y < image.height(); ++y) {
    for (int x = 0; x < image.width(); ++x) ink.push_back(255 - qGray(image.pixel(x, y)));
  }
  return ink;
}

int sum(const Ink& ink) { return std::accumulate(ink.begin(), ink.end(), 0); }

// Of all the ink of two that lie on each other, how much both have: 0 none, 1 all of it.
double inCommon(const Ink& a, const Ink& b) {
  int both = 0;
  int either = 0;
  for (std::size_t i = 0; i < a.size(); ++i) {
    both += std::min(a[i], b[i]);
    either += std::max(a[i], b[i]);
  }
  return static_cast<double>(both) / either;
}

TEST(Signs, areThereForEveryKindOfHappening) {
  for (const HappeningKind kind : kHappeningKinds) {
    const Ink ink = inkOf(nameOf(kind));
    ASSERT_FALSE(ink.empty()) << nameOf(kind);
    EXPECT_GT(sum(ink), 255 * kSide * kSide / 8) << nameOf(kind) << " can hardly be seen";
  }
}

TEST(Signs, areThereForEveryButton) {
  for (const char* name : {"record", "stop", "mark", "play", "pause", "next", "previous"}) {
    EXPECT_FALSE(inkOf(name).empty()) << name;
  }
}

TEST(Signs, areToldApartByTheirShape) {
  for (const HappeningKind one : kHappeningKinds) {
    for (const HappeningKind other : kHappeningKinds) {
      if (one >= other) continue;
      EXPECT_LT(inCommon(inkOf(nameOf(one)), inkOf(nameOf(other))), 0.5)
          << nameOf(one) << " looks like " << nameOf(other);
    }
  }
}

TEST(Signs, stayWithinTheirSquare) {
  constexpr int kMargin = 4;
  for (const HappeningKind kind : kHappeningKinds) {
    EXPECT_EQ(sum(inkOf(nameOf(kind), kMargin)), sum(inkOf(nameOf(kind)))) << nameOf(kind);
  }
}

TEST(Signs, ofAnyOtherNameAreNone) {
  EXPECT_TRUE(inkOf("").empty());
  EXPECT_TRUE(inkOf("cells").empty());
}

}  // namespace
}  // namespace qel

// pictures size FILE: its width and height. pictures same FILE FILE: ends with 0 when nobody could
// tell one from the other, with 1 otherwise.

#include <QtGui/QImage>
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <string_view>

namespace {

// Text that slid has other roundings at the edges of its letters.
constexpr int kUnseen = 8;

bool areAlike(QRgb a, QRgb b) {
  return std::max({std::abs(qRed(a) - qRed(b)), std::abs(qGreen(a) - qGreen(b)),
                   std::abs(qBlue(a) - qBlue(b))}) <= kUnseen;
}

bool areAlike(const QImage& a, const QImage& b) {
  if (a.isNull() || a.size() != b.size()) return false;
  for (int y = 0; y < a.height(); ++y) {
    for (int x = 0; x < a.width(); ++x) {
      if (!areAlike(a.pixel(x, y), b.pixel(x, y))) return false;
    }
  }
  return true;
}

}  // namespace

int main(int argc, char** argv) {
  const std::string_view what = argc > 1 ? argv[1] : "";
  if (what == "size" && argc == 3) {
    const QImage picture(argv[2]);
    std::printf("%dx%d\n", picture.width(), picture.height());
    return picture.isNull() ? 1 : 0;
  }
  if (what == "same" && argc == 4) return areAlike(QImage(argv[2]), QImage(argv[3])) ? 0 : 1;
  return 64;
}

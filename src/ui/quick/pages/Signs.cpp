#include "ui/quick/pages/Signs.h"

#include <QtGui/QPainterPath>
#include <QtGui/QPolygonF>
#include <algorithm>
#include <array>
#include <initializer_list>

namespace qel {
namespace {

// All of them are drawn on a square of so many units, which is as many pixels in a list.
constexpr qreal kUnits = 16;
constexpr qreal kLineWidth = 1.6;

struct Sketch {
  QPainterPath lines;
  QPainterPath areas;  // one within another is a hole

  void line(std::initializer_list<QPointF> points) { lines.addPolygon(QPolygonF(points)); }
  void area(std::initializer_list<QPointF> points) {
    areas.addPolygon(QPolygonF(points));
    areas.closeSubpath();
  }
  void ring(QPointF middle, qreal radius) { lines.addEllipse(middle, radius, radius); }
  void disc(QPointF middle, qreal radius) { areas.addEllipse(middle, radius, radius); }
  // About the middle, to the left and to the right.
  void waves(QPointF middle, qreal radius) {
    constexpr qreal kHalfAngle = 42;
    const QRectF around(middle.x() - radius, middle.y() - radius, 2 * radius, 2 * radius);
    for (const qreal direction : {0.0, 180.0}) {
      lines.arcMoveTo(around, direction - kHalfAngle);
      lines.arcTo(around, direction - kHalfAngle, 2 * kHalfAngle);
    }
  }
  void arrow(QPointF from, QPointF to) {
    constexpr qreal kHead = 3.2;
    const QPointF along =
        (to - from) / std::max(std::abs(to.x() - from.x()), std::abs(to.y() - from.y()));
    const QPointF across(-along.y(), along.x());
    const QPointF neck = to - kHead * along;
    line({from, to});
    line({neck + kHead * across, to, neck - kHead * across});
  }
};

// A mast that sends.
void drawCell(Sketch& sketch) {
  const QPointF top(8, 6.5);
  sketch.disc(top, 1.7);
  sketch.waves(top, 3.8);
  sketch.waves(top, 6.8);
  sketch.line({{8, 8}, {8, 14.8}});
}

// One in place of the other.
void drawTechnology(Sketch& sketch) {
  sketch.arrow({1.5, 4.6}, {14, 4.6});
  sketch.arrow({14.5, 11.4}, {2, 11.4});
}

// Two that are joined.
void drawRrc(Sketch& sketch) {
  sketch.ring({3.6, 8}, 2.6);
  sketch.ring({12.4, 8}, 2.6);
  sketch.line({{6.2, 8}, {9.8, 8}});
}

// Two that are joined no more.
void drawRadioLinkFailure(Sketch& sketch) {
  sketch.disc({2.2, 8}, 2.2);
  sketch.disc({13.8, 8}, 2.2);
  sketch.line({{5.4, 5.4}, {10.6, 10.6}});
  sketch.line({{10.6, 5.4}, {5.4, 10.6}});
}

void drawRegistration(Sketch& sketch) {
  sketch.ring({8, 8}, 6.8);
  sketch.line({{4.8, 8.2}, {7.1, 10.6}, {11.4, 5.6}});
}

// No entry.
void drawReject(Sketch& sketch) {
  sketch.disc({8, 8}, 7.4);
  sketch.areas.addRect(3.6, 6.7, 8.8, 2.6);
}

// Up and down.
void drawBearer(Sketch& sketch) {
  sketch.arrow({4.6, 14.5}, {4.6, 2});
  sketch.arrow({11.4, 1.5}, {11.4, 14});
}

// Two of a spectrum, one beside the other.
void drawCarrier(Sketch& sketch) {
  sketch.area({{0.8, 13.6}, {2.2, 3.6}, {5.8, 3.6}, {7.2, 13.6}});
  sketch.line({{8.9, 12.8}, {10.2, 4.4}, {13.4, 4.4}, {14.8, 12.8}, {8.9, 12.8}});
}

// Two units of a rack.
void drawService(Sketch& sketch) {
  for (const qreal top : {2.2, 9.2}) {
    sketch.lines.addRect(1.8, top, 12.4, 4.6);
    sketch.disc({4.6, top + 2.3}, 1.1);
  }
}

// A chip.
void drawModem(Sketch& sketch) {
  sketch.lines.addRect(4, 4, 8, 8);
  for (const qreal at : {6.0, 10.0}) {
    sketch.line({{at, 1}, {at, 4}});
    sketch.line({{at, 12}, {at, 15}});
    sketch.line({{1, at}, {4, at}});
    sketch.line({{12, at}, {15, at}});
  }
}

// Two ends and nothing between them.
void drawGap(Sketch& sketch) {
  sketch.line({{0.8, 8}, {4.6, 8}});
  sketch.line({{4.6, 3.6}, {4.6, 12.4}});
  sketch.line({{11.4, 3.6}, {11.4, 12.4}});
  sketch.line({{11.4, 8}, {15.2, 8}});
}

// A flag.
void drawMark(Sketch& sketch) {
  sketch.line({{3.4, 1.4}, {3.4, 14.8}});
  sketch.area({{4, 1.4}, {13.6, 5}, {4, 8.8}});
}

void drawRecord(Sketch& sketch) { sketch.disc({8, 8}, 7); }
void drawStop(Sketch& sketch) { sketch.areas.addRoundedRect(1.5, 1.5, 13, 13, 2, 2); }
void drawPlay(Sketch& sketch) { sketch.area({{3, 1}, {14.4, 8}, {3, 15}}); }

void drawPause(Sketch& sketch) {
  sketch.areas.addRect(2.4, 1.4, 4, 13.2);
  sketch.areas.addRect(9.6, 1.4, 4, 13.2);
}

void drawNext(Sketch& sketch) {
  sketch.area({{2, 2}, {11.2, 8}, {2, 14}});
  sketch.areas.addRect(11.8, 2, 2.4, 12);
}

void drawPrevious(Sketch& sketch) {
  sketch.area({{14, 2}, {4.8, 8}, {14, 14}});
  sketch.areas.addRect(1.8, 2, 2.4, 12);
}

struct Sign {
  QLatin1StringView name;
  void (*draw)(Sketch&);
};

constexpr std::array kSigns = {
    Sign{QLatin1StringView("cell"), drawCell},
    Sign{QLatin1StringView("technology"), drawTechnology},
    Sign{QLatin1StringView("rrc"), drawRrc},
    Sign{QLatin1StringView("radio-link-failure"), drawRadioLinkFailure},
    Sign{QLatin1StringView("registration"), drawRegistration},
    Sign{QLatin1StringView("reject"), drawReject},
    Sign{QLatin1StringView("bearer"), drawBearer},
    Sign{QLatin1StringView("carrier"), drawCarrier},
    Sign{QLatin1StringView("service"), drawService},
    Sign{QLatin1StringView("modem"), drawModem},
    Sign{QLatin1StringView("gap"), drawGap},
    Sign{QLatin1StringView("mark"), drawMark},
    Sign{QLatin1StringView("record"), drawRecord},
    Sign{QLatin1StringView("stop"), drawStop},
    Sign{QLatin1StringView("play"), drawPlay},
    Sign{QLatin1StringView("pause"), drawPause},
    Sign{QLatin1StringView("next"), drawNext},
    Sign{QLatin1StringView("previous"), drawPrevious},
};

}  // namespace

bool drawSign(QPainter& painter, const QRectF& square, QStringView name, const QColor& color) {
  const auto* sign =
      std::ranges::find_if(kSigns, [name](const Sign& each) { return name == each.name; });
  if (sign == kSigns.end()) return false;
  Sketch sketch;
  sign->draw(sketch);
  painter.save();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.translate(square.topLeft());
  painter.scale(square.width() / kUnits, square.height() / kUnits);
  painter.strokePath(sketch.lines,
                     QPen(color, kLineWidth, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter.fillPath(sketch.areas, color);
  painter.restore();
  return true;
}

}  // namespace qel

// The curves under one finger and under two, with touch points as a screen reports them.

#include <gtest/gtest.h>

#include <QtCore/QCoreApplication>
#include <QtCore/QPoint>
#include <QtCore/QPointF>
#include <QtGui/QGuiApplication>
#include <QtGui/QPointingDevice>
#include <QtGui/QWheelEvent>
#include <QtTest/QTest>
#include <map>
#include <memory>

#include "messages/lte_neighbours.h"
#include "messages/lte_serving.h"
#include "ui/Reports.h"
#include "ui/Window.h"

namespace qel {
namespace {

using testing::Window;

QQuickItem* firstChartBelow(QQuickItem* item) {
  if (item->inherits("qel::ChartItem")) return item;
  for (QQuickItem* child : item->childItems()) {
    if (QQuickItem* found = firstChartBelow(child)) return found;
  }
  return nullptr;
}

class PastClock final : public Clock {
 public:
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = 0;
};

// So that there are curves wherever a finger moves to.
void reportTheHourBeforeNow(History& history) {
  constexpr std::uint64_t kEveryMs = 4000;
  PastClock clock;
  const auto validator = MetricValidator::shared();
  validator->setObserver(&history, clock);
  auto average = std::make_shared<RsrpRsrqSinr>();
  average->setRsrp0(-86);
  average->setRsrq0(-9);
  average->setSinr0(20);
  KCellularLteRsrpRsrqSinr signal;
  signal.setAvgValues(average);
  const std::uint64_t now = systemClock().nowMs();
  for (clock.timeMs = now - 3'600'000; clock.timeMs <= now; clock.timeMs += kEveryMs) {
    validator->processMetric(
        {{"kKeyMetricID", MetricValidator::K_LTE_RSRP_RSRQ_SINR}, {"kKeyPayload", signal.data()}});
  }
  validator->setObserver(&history);
}

void reportNeighbour() {
  auto cell = std::make_shared<EgwErrcNbrEutraMeas>();
  cell->setNbrEarfcn(1300);
  cell->setNbrPhysCellId(321);
  cell->setNbrRsrp(40);
  cell->setNbrRsrq(14);
  KCellularLteNbrEutraCellMeas neighbours;
  neighbours.addMeasNbrEutra(cell);
  MetricValidator::shared()->processMetric(
      {{"kKeyMetricID", MetricValidator::K_LTE_INTRARAT_MEAS}, {"kKeyPayload", neighbours.data()}});
}

class SignalsUnderFingers : public ::testing::Test {
 protected:
  SignalsUnderFingers() {
    reportTheHourBeforeNow(window.navigation().pages()->history());
    window.window().resize(360, 300);
    window.press(Qt::Key_S);
    curves().move(0.5);
    shown = QTest::qWaitFor([this] {
      window.settle();
      return window.shows("LTE RSRP") && !curves().isAtEnd();
    });
    chart = firstChartBelow(window.window().contentItem());
  }

  void SetUp() override {
    ASSERT_TRUE(shown);
    ASSERT_TRUE(chart);
  }
  void TearDown() override { EXPECT_EQ(window.warnings(), 0); }

  SignalsModel& curves() const { return *window.navigation().pages()->curves(); }
  bool isReading() const { return !curves().readOff().toMap().isEmpty(); }
  double placeRead() const { return curves().readOff().toMap()["place"].toDouble(); }

  // So many ways to the right in what is drawn of the first chart, and so far below its middle.
  QPoint at(double place, int below = 0) const {
    const double x =
        chart->property("plotLeft").toDouble() + place * chart->property("plotWidth").toDouble();
    return chart->mapToScene(QPointF(x, chart->height() / 2 + below)).toPoint();
  }
  // How long before the moment that lies which stands at a place.
  double agoMs(double place) const {
    const SignalsRange& range = curves().range();
    return static_cast<double>(range.backMs) + (1 - place) * static_cast<double>(range.spanMs);
  }

  void press(int finger, QPoint place) {
    report([&] { touch.press(finger, place, &window.window()); }, finger);
    fingers[finger] = place;
  }
  void release(int finger) {
    report([&] { touch.release(finger, fingers[finger], &window.window()); }, finger);
    fingers.erase(finger);
  }
  // All of them at once, in small steps.
  void move(const std::map<int, QPoint>& targets) {
    constexpr int kSteps = 16;
    const auto before = fingers;
    for (int step = 1; step <= kSteps; ++step) {
      for (auto& [finger, place] : fingers) {
        const auto target = targets.find(finger);
        if (target == targets.end()) {
          touch.stationary(finger);
          continue;
        }
        place = before.at(finger) + (target->second - before.at(finger)) * step / kSteps;
        touch.move(finger, place, &window.window());
      }
      touch.commit();
      drawFrame();
    }
  }
  // Moves are handled once a frame.
  void drawFrame() const {
    bool drawn = false;
    const auto watch =
        QObject::connect(&window.window(), &QQuickWindow::frameSwapped, [&drawn] { drawn = true; });
    window.window().update();
    EXPECT_TRUE(QTest::qWaitFor([&drawn] { return drawn; }));
    QObject::disconnect(watch);
  }
  void turnWheel(QPoint place, int angle) {
    QWheelEvent turned(place, place, QPoint(), QPoint(0, angle), Qt::NoButton, Qt::NoModifier,
                       Qt::NoScrollPhase, false);
    QCoreApplication::sendEvent(&window.window(), &turned);
    window.settle();
  }
  void tap(QPoint place) {
    press(0, place);
    release(0);
  }

  const Window window;
  const std::unique_ptr<QPointingDevice> device{QTest::createTouchDevice()};
  QTest::QTouchEventSequence touch{QTest::touchEvent(&window.window(), device.get(), false)};
  std::map<int, QPoint> fingers;
  QQuickItem* chart = nullptr;
  bool shown = false;

 private:
  template <typename Change>
  void report(const Change& change, int changed) {
    for (const auto& [finger, place] : fingers) {
      if (finger != changed) touch.stationary(finger);
    }
    change();
    touch.commit();
    window.settle();
  }
};

TEST_F(SignalsUnderFingers, twoZoomAboutTheirMiddle) {
  press(0, at(0.35));
  press(1, at(0.45));
  const double before = agoMs(0.4);
  const auto spanBefore = curves().range().spanMs;
  move({{0, at(0.1)}, {1, at(0.7)}});
  EXPECT_LT(curves().range().spanMs, spanBefore / 2);
  EXPECT_NEAR(agoMs(0.4), before, 0.03 * static_cast<double>(spanBefore));
  const auto near = curves().range().spanMs;
  move({{0, at(0.35)}, {1, at(0.45)}});
  EXPECT_GT(curves().range().spanMs, near * 2) << "and back, without a finger lifted";
  release(1);
  release(0);
  EXPECT_FALSE(isReading());
}

TEST_F(SignalsUnderFingers, oneAboveTheOtherZoomsToo) {
  const auto spanBefore = curves().range().spanMs;
  const double top = at(0).y();
  press(0, at(0.5, -15));
  press(1, at(0.5, 15));
  move({{0, at(0.5, -60)}, {1, at(0.5, 60)}});
  EXPECT_LT(curves().range().spanMs, spanBefore * 3 / 4);
  EXPECT_NEAR(at(0).y(), top, 1) << "the page rests";
}

TEST_F(SignalsUnderFingers, aSecondZoomsAfterTheFirstMoved) {
  press(0, at(0.6));
  move({{0, at(0.3)}});
  const double before = agoMs(0.4);
  const auto spanBefore = curves().range().spanMs;
  press(1, at(0.5));
  move({{0, at(0.1)}, {1, at(0.7)}});
  EXPECT_LT(curves().range().spanMs, spanBefore * 3 / 4);
  EXPECT_NEAR(agoMs(0.4), before, 0.1 * static_cast<double>(spanBefore))
      << "all but the first steps, which still were the one finger's";
}

TEST_F(SignalsUnderFingers, aSecondZoomsWhileTheFirstRests) {
  press(0, at(0.2));
  ASSERT_TRUE(QTest::qWaitFor([this] { return isReading(); }));
  const auto spanBefore = curves().range().spanMs;
  press(1, at(0.4));
  move({{1, at(0.9)}});
  EXPECT_LT(curves().range().spanMs, spanBefore * 3 / 4);
  const double read = placeRead();
  release(1);
  release(0);
  EXPECT_EQ(placeRead(), read) << "a lifted finger is no tap";
}

TEST_F(SignalsUnderFingers, whoIsLeftOfTwoDoesNotJump) {
  press(0, at(0.4));
  press(1, at(0.5));
  move({{0, at(0.1)}, {1, at(0.8)}});
  release(1);
  const auto zoomed = curves().range();
  move({{0, at(0.2)}});
  EXPECT_NEAR(static_cast<double>(curves().range().backMs), static_cast<double>(zoomed.backMs),
              0.11 * static_cast<double>(zoomed.spanMs));
  release(0);
  EXPECT_FALSE(isReading());
}

TEST_F(SignalsUnderFingers, oneDraggedSidewaysMovesThroughTime) {
  const auto before = curves().range();
  press(0, at(0.3));
  move({{0, at(0.8)}});
  release(0);
  EXPECT_EQ(curves().range().spanMs, before.spanMs);
  const auto moved =
      static_cast<double>(curves().range().backMs) - static_cast<double>(before.backMs);
  EXPECT_NEAR(moved, 0.5 * static_cast<double>(before.spanMs),
              0.06 * static_cast<double>(before.spanMs));
  EXPECT_FALSE(isReading());
}

TEST_F(SignalsUnderFingers, oneDraggedSidewaysMayGoOnUpAndDown) {
  press(0, at(0.3));
  move({{0, at(0.6)}});
  const double top = at(0).y();
  const auto before = curves().range().backMs;
  move({{0, at(0.6, -60)}});
  move({{0, at(0.9, -60)}});
  EXPECT_EQ(at(0).y(), top) << "the page rests";
  EXPECT_GT(curves().range().backMs, before);
  release(0);
}

TEST_F(SignalsUnderFingers, aTapReadsOffAndASecondStops) {
  tap(at(0.5));
  ASSERT_TRUE(isReading());
  EXPECT_NEAR(placeRead(), 0.5, 0.02);
  tap(at(0.5));
  EXPECT_FALSE(isReading());
}

TEST_F(SignalsUnderFingers, oneTakenAwayByTheSystemIsNoTap) {
  press(0, at(0.5));
  QTouchEvent cancelled(QEvent::TouchCancel, device.get());
  QCoreApplication::sendEvent(&window.window(), &cancelled);
  window.settle();
  EXPECT_FALSE(isReading());
  fingers.clear();
  QTest::qWait(400);  // in which a held finger would have read
  EXPECT_FALSE(isReading());
}

TEST_F(SignalsUnderFingers, oneThatIsHeldReadsOffWhereverItMoves) {
  const auto before = curves().range();
  press(0, at(0.3));
  ASSERT_TRUE(QTest::qWaitFor([this] { return isReading(); }));
  EXPECT_NEAR(placeRead(), 0.3, 0.02);
  move({{0, at(0.32)}});
  EXPECT_NEAR(placeRead(), 0.32, 0.01) << "from the first pixel on";
  const double top = at(0).y();
  move({{0, at(0.8, -70)}});
  EXPECT_NEAR(placeRead(), 0.8, 0.02);
  EXPECT_EQ(at(0).y(), top) << "the page rests";
  release(0);
  EXPECT_NEAR(placeRead(), 0.8, 0.02) << "what was read stays";
  EXPECT_EQ(curves().range(), before);
  tap(at(0.8));
  EXPECT_FALSE(isReading()) << "the next is a tap again";
}

TEST_F(SignalsUnderFingers, oneSwipedUpScrollsThePage) {
  const auto before = curves().range();
  const double top = at(0).y();
  press(0, at(0.5));
  move({{0, at(0.5, -80)}});
  EXPECT_LT(at(0).y(), top - 40);
  release(0);
  EXPECT_EQ(curves().range(), before);
  EXPECT_FALSE(isReading());
}

TEST_F(SignalsUnderFingers, aWheelZoomsWhereItStands) {
  const auto spanBefore = curves().range().spanMs;
  const double before = agoMs(0.25);
  const double top = at(0).y();
  turnWheel(at(0.25), 120);
  EXPECT_EQ(curves().range().spanMs, spanBefore * 4 / 5);
  EXPECT_NEAR(agoMs(0.25), before, 0.01 * static_cast<double>(spanBefore));
  turnWheel(at(0.25), -120);
  EXPECT_EQ(curves().range().spanMs, spanBefore);
  EXPECT_EQ(at(0).y(), top) << "the page rests";
}

TEST_F(SignalsUnderFingers, aMouseDragsTapsAndHoldsAlike) {
  QQuickWindow* shownWindow = &window.window();
  const auto before = curves().range().backMs;
  QTest::mousePress(shownWindow, Qt::LeftButton, Qt::NoModifier, at(0.3));
  for (double place = 0.3; place <= 0.7; place += 0.02) QTest::mouseMove(shownWindow, at(place));
  QTest::mouseRelease(shownWindow, Qt::LeftButton, Qt::NoModifier, at(0.7));
  EXPECT_GT(curves().range().backMs, before);
  EXPECT_FALSE(isReading());
  QTest::mouseClick(shownWindow, Qt::LeftButton, Qt::NoModifier, at(0.7));
  EXPECT_TRUE(isReading());
  QTest::mouseClick(shownWindow, Qt::LeftButton, Qt::NoModifier, at(0.7));
  EXPECT_FALSE(isReading());
  QTest::mousePress(shownWindow, Qt::LeftButton, Qt::NoModifier, at(0.3));
  ASSERT_TRUE(QTest::qWaitFor([this] { return isReading(); }));
  for (double place = 0.3; place <= 0.7; place += 0.02) QTest::mouseMove(shownWindow, at(place));
  EXPECT_NEAR(placeRead(), 0.7, 0.04);
  QTest::mouseRelease(shownWindow, Qt::LeftButton, Qt::NoModifier, at(0.7));
}

// Thresholds, words and codes once left far less.
TEST(SignalsInLargeText, leaveHalfOfTheWidthToTheCurves) {
  QFont large = QGuiApplication::font();
  large.setPointSize(22);
  QGuiApplication::setFont(large);
  const Window window;
  reportTheHourBeforeNow(window.navigation().pages()->history());
  testing::reportCell(123);
  reportNeighbour();
  window.navigation().open(QStringLiteral("signals"));
  ASSERT_EQ(window.navigation().pages()->curves()->neighbours()->rowCount(), 1);
  for (const QSize size : {QSize(320, 568), QSize(720, 360)}) {
    window.window().resize(size);
    window.settle();
    const QQuickItem* chart = firstChartBelow(window.window().contentItem());
    ASSERT_TRUE(chart);
    EXPECT_GE(chart->property("plotWidth").toReal(), chart->width() / 2) << size.width();
  }
}

}  // namespace
}  // namespace qel

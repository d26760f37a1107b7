// answers NAME [gles]: how long the viewer's window takes to show what was asked of it, by the
// clock, on the platform and with the renderer that the environment names. Prints one table row.
// "gles" asks for OpenGL ES.

#include <QtGui/QMouseEvent>
#include <QtGui/QSurfaceFormat>
#include <cstdio>
#include <functional>
#include <string>
#include <string_view>

#include "base/Clock.h"
#include "messages/lte_serving.h"
#include "metrics/MetricValidator.h"
#include "programs/Figures.h"
#include "programs/ViewerWindow.h"

namespace qel::benchmarks {
namespace {

using namespace std::chrono_literals;

constexpr int kStrokes = 6;
constexpr int kStep = 24;  // points that a finger moves from frame to frame
constexpr int kTimes = 25;
constexpr std::uint64_t kMinutesMs = 600'000;

struct PastClock final : qel::Clock {
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = systemClock().nowMs() - kMinutesMs;
};

// Ten minutes of a level each second.
void fillHistory(const ViewerWindow& viewer) {
  const auto validator = MetricValidator::shared();
  History& history = viewer.navigation().pages()->history();
  PastClock clock;
  validator->setObserver(&history, clock);
  for (std::uint64_t passed = 0; passed < kMinutesMs; passed += 1000, clock.timeMs += 1000) {
    auto average = std::make_shared<RsrpRsrqSinr>();
    average->setRsrp0(-100 + static_cast<std::int32_t>(passed / 1000 % 23));
    average->setRsrq0(-9 - static_cast<std::int32_t>(passed / 1000 % 5));
    average->setSinr0(20);
    KCellularLteRsrpRsrqSinr report;
    report.setAvgValues(average);
    validator->processMetric(
        {{"kKeyMetricID", MetricValidator::K_LTE_RSRP_RSRQ_SINR}, {"kKeyPayload", report.data()}});
  }
  validator->setObserver(&history);
}

class Measurement {
 public:
  explicit Measurement(const ViewerWindow& viewer) : _viewer(viewer) {}

  // From the call to the frame that shows it.
  void take(const std::function<void()>& ask) {
    const auto begun = Clock::now();
    ask();
    if (waitForFrame(_viewer.window())) {
      _times.push_back(Milliseconds(Clock::now() - begun).count());
    } else {
      ++_unanswered;
    }
  }
  std::string result() const {
    std::string answer = text(median(_times), "", 0) + "/ " + text(percentile(_times, 1), "ms", 0);
    if (_unanswered > 0) answer += ", " + std::to_string(_unanswered) + " without an answer";
    return answer;
  }

 private:
  const ViewerWindow& _viewer;
  std::vector<double> _times;
  int _unanswered = 0;
};

void touch(const ViewerWindow& viewer, QEvent::Type type, int y) {
  const QPointF place(viewer.window().width() / 2, y);
  const auto pressed = type == QEvent::MouseButtonRelease ? Qt::NoButton : Qt::LeftButton;
  const auto button = type == QEvent::MouseMove ? Qt::NoButton : Qt::LeftButton;
  QMouseEvent event(type, place, place, button, pressed, Qt::NoModifier);
  event.setTimestamp(static_cast<quint64>(
      std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now().time_since_epoch())
          .count()));
  QCoreApplication::sendEvent(&viewer.window(), &event);
}

// A finger that pulls the table up, rests and is lifted.
std::string scrolling(const ViewerWindow& viewer) {
  Measurement steps(viewer);
  for (int stroke = 0; stroke < kStrokes; ++stroke) {
    int y = viewer.window().height() - 2 * kStep;
    touch(viewer, QEvent::MouseButtonPress, y);
    for (int i = 0; i < 2; ++i) touch(viewer, QEvent::MouseMove, y -= kStep);  // it is a pull
    handleEvents(500ms);
    while (y > 6 * kStep) steps.take([&] { touch(viewer, QEvent::MouseMove, y -= kStep); });
    handleEvents(300ms);
    touch(viewer, QEvent::MouseMove, y);
    touch(viewer, QEvent::MouseButtonRelease, y);
    handleEvents(500ms);
  }
  return steps.result();
}

std::string redraw(const ViewerWindow& viewer) {
  Measurement redraws(viewer);
  for (int i = 1; i <= kTimes; ++i) {
    fillStore(1000 * i);
    redraws.take(tick);
    handleEvents(1s);  // the highlight goes
  }
  return redraws.result();
}

std::string opening(const ViewerWindow& viewer) {
  Measurement openings(viewer);
  for (int i = 0; i < kTimes; ++i) {
    openings.take([&] { viewer.choose("EUTRA Neighbor Info"); });
    handleEvents(1s);
    viewer.navigation().back();
    handleEvents(1s);
  }
  return openings.result();
}

std::string curves(const ViewerWindow& viewer) {
  fillHistory(viewer);
  viewer.navigation().open(QStringLiteral("signals"));
  handleEvents(2s);
  Measurement zooms(viewer);
  SignalsModel& page = *viewer.navigation().pages()->curves();
  for (int i = 0; i < kTimes; ++i) {
    zooms.take([&] { page.zoom(page.canZoomIn() && i % 2 == 0 ? 0.5 : 2, 1); });
    handleEvents(300ms);
  }
  return zooms.result();
}

void measure(const ViewerWindow& viewer, const std::string& name) {
  handleEvents(2s);
  fillStore(0);
  viewer.choose("LTE");
  handleEvents(2s);
  const std::string opened = opening(viewer);
  viewer.choose("EUTRA Neighbor Info");
  handleEvents(2s);
  const std::string scrolled = scrolling(viewer);
  const std::string redrawn = redraw(viewer);
  std::printf("| %s | %s | %s | %s | %s |\n", name.c_str(), scrolled.c_str(), redrawn.c_str(),
              opened.c_str(), curves(viewer).c_str());
}

}  // namespace
}  // namespace qel::benchmarks

int main(int argc, char** argv) {
  using namespace qel::benchmarks;
  if (argc < 2) return 64;
  if (argc == 3 && std::string_view(argv[2]) == "gles") {
    QSurfaceFormat format;
    format.setRenderableType(QSurfaceFormat::OpenGLES);
    QSurfaceFormat::setDefaultFormat(format);
  }
  const std::string name = argv[1];
  const ViewerWindow viewer(argc, argv);
  if (!viewer.isThere()) return 1;
  measure(viewer, name);
}

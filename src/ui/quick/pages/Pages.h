// The pages beside the tables, kept up to date while they are in sight.
#pragma once

#include <QtQml/qqmlregistration.h>
#include <QtCore/QElapsedTimer>
#include <QtCore/QObject>
#include <QtCore/QTimer>
#include <chrono>
#include <memory>
#include <optional>
#include <string>

#include "history/History.h"
#include "metrics/MetricValidator.h"
#include "ui/pages/Feed.h"
#include "ui/quick/pages/BootTimer.h"
#include "ui/quick/pages/FreshnessModel.h"
#include "ui/quick/pages/HappeningsModel.h"
#include "ui/quick/pages/NowModel.h"
#include "ui/quick/pages/PlaybackModel.h"
#include "ui/quick/pages/RecorderModel.h"
#include "ui/quick/pages/RecordingsModel.h"
#include "ui/quick/pages/SheetModel.h"
#include "ui/quick/pages/SignalsModel.h"

namespace qel {

// GUI thread only; one a window. Listens to the dispatcher of the process as long as it lives. A
// page that is not in sight costs nothing; one in sight is made anew when something new was told,
// twice a second at most, and when it would read differently though nothing came. Else no timer
// runs.
class Pages : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by Navigation")
  Q_PROPERTY(qel::NowModel* now READ now CONSTANT)
  Q_PROPERTY(qel::SignalsModel* curves READ curves CONSTANT)
  Q_PROPERTY(qel::HappeningsModel* happenings READ happenings CONSTANT)
  Q_PROPERTY(qel::FreshnessModel* freshness READ freshness CONSTANT)
  Q_PROPERTY(qel::PlaybackModel* playback READ playback CONSTANT)
  Q_PROPERTY(qel::RecorderModel* recorder READ recorder CONSTANT)
  Q_PROPERTY(qel::RecordingsModel* recordings READ recordings CONSTANT)
  Q_PROPERTY(qel::SheetModel* sheet READ sheet CONSTANT)
  Q_PROPERTY(bool shown READ isShown WRITE setShown NOTIFY shownChanged)

 public:
  explicit Pages(QObject* parent = nullptr);
  ~Pages() override;

  NowModel* now() { return &_now; }
  SignalsModel* curves() { return &_curves; }
  HappeningsModel* happenings() { return &_happenings; }
  FreshnessModel* freshness() { return &_freshness; }
  PlaybackModel* playback() { return &_playback; }
  RecorderModel* recorder() { return &_recorder; }
  RecordingsModel* recordings() { return &_recordings; }
  SheetModel* sheet() { return &_sheet; }
  // The live one.
  History& history() { return _history; }

  // What feeds the viewer, at every change of it.
  void setFeed(const Feed& feed);
  // Which screen is in sight: "first", a page's name, or anything else.
  void setInSight(const QString& screen);
  // Whether the window can be seen: if not, no page is made.
  bool isShown() const { return _isShown; }
  void setShown(bool shown);
  // Something may have been told: if so, the page in sight follows.
  void look();
  // The table in sight was drawn: what lies over it follows.
  void tableDrawn();
  // Opens a recording of the list.
  Q_INVOKABLE void openRecording(const QString& name);

 signals:
  // The values of another moment are shown than those that were: tables are to be drawn anew.
  void momentChanged();
  void shownChanged();

 private:
  void playbackChanged();
  void recorderChanged();
  void refreshSoon(std::chrono::milliseconds interval);
  std::optional<std::uint64_t> refreshInSight(const Viewpoint& view, const Feed& feed);
  Feed feed() const;
  void refresh();
  void waitUntil(std::optional<std::uint64_t> changesAtMs, std::uint64_t nowMs);

  const std::shared_ptr<MetricValidator> _validator = MetricValidator::shared();
  History _history;
  Feed _feed;
  bool _knowsFeed = false;  // till then nothing is said of it
  QString _inSight;
  bool _isShown = true;
  std::optional<std::uint64_t> _seen;  // version of the history
  QElapsedTimer _sinceRefresh;
  QTimer _soon;      // the next refresh, while one is due
  BootTimer _later;  // when the page reads differently by itself
  NowModel _now;
  SignalsModel _curves;
  HappeningsModel _happenings;
  FreshnessModel _freshness;
  PlaybackModel _playback;
  RecorderModel _recorder;
  RecordingsModel _recordings;
  SheetModel _sheet;
  std::optional<std::uint64_t> _moment;       // of the opened recording; none: it is live
  std::optional<std::uint64_t> _shownMoment;  // the one on the screens
  std::string _growing;                       // recording, as the list shows it
};

}  // namespace qel

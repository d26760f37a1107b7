#include "app/Source.h"

#include <QtCore/QFileInfo>
#include <QtCore/QLocale>
#include <QtCore/QPointer>
#include <chrono>
#include <utility>

#include "app/EventLoopWait.h"
#include "base/FileContent.h"
#include "base/TerminalText.h"
#include "feed/EmbeddedFeed.h"
#include "recording/RecordingsFolder.h"
#include "sources/diagnostics/port/PortName.h"
#include "tesk/Transport.h"
#include "ui/kit/ResourceBundle.h"

namespace qel {
namespace {

const QString kRecording = QStringLiteral("recording:");
constexpr std::chrono::milliseconds kPatienceOfASelfTest{5000};
// Screens are drawn every five seconds and pages twice a second.
constexpr std::chrono::milliseconds kRestOfEvents{250};
constexpr std::size_t kLargestConfiguration = 1024 * 1024;
const QString kSimulated = QStringLiteral("simulated");
const QString kDiagnostics = QStringLiteral("diag:");

// The name of the file behind the beginning of a source's text.
QString fileIn(const QString& text, const QString& beginning) {
  return QFileInfo(text.mid(beginning.size()).section(u',', 0, 0)).fileName();
}

QString lossInWords(std::uint64_t dropped) {
  return QLocale(QLocale::English).toString(static_cast<qulonglong>(dropped)) +
         QStringLiteral(" reports left out, which came faster than they could be shown");
}

}  // namespace

Source::~Source() {
  tesk::setConnector(nullptr);
  for (const auto& connector : {_connector, _recordConnector}) {
    if (connector) connector->close();
  }
}

int Source::open(const Options& options) {
  _book = std::make_shared<FeedBook>(options.source, options.bus);
  if (!options.source.empty()) return openWithin(options.source);
  _bus = options.bus;
  _watch = std::make_shared<ServiceWatch>(options.bus);
  const auto patience = options.selfTest ? std::optional(kPatienceOfASelfTest) : std::nullopt;
  const auto watch = [first = _book->reachability(), then = _watch->observer()](
                         bool reachable, const std::string& why) {
    first(reachable, why);
    then(reachable, why);
  };
  _connector = std::make_shared<ClosingConnector>(tesk::bus::makeBusConnector(
      {options.bus}, watch, [patience] { return std::make_shared<EventLoopWait>(patience); },
      conditionObserver(), kRestOfEvents));
  tesk::setConnector(_connector);
  // A recording tells when each event came.
  _recordConnector = std::make_shared<ClosingConnector>(tesk::bus::makeBusConnector(
      {options.bus}, {}, [patience] { return std::make_shared<EventLoopWait>(patience); }));
  return 0;
}

tesk::bus::ConditionObserver Source::conditionObserver() const {
  return [first = _book->condition(),
          then = _condition->observer()](const tesk::bus::Condition& told) {
    first(told);
    then(told.line);
  };
}

void Source::showIn(Navigation& navigation) {
  if (_watch) _watch->showIn(navigation);
  _condition->showIn(navigation);
  Pages* pages = navigation.pages();
  _book->setHistory(&pages->history());
  _book->setObserver([book = _book.get(), pages = QPointer(pages)] {
    if (pages) pages->setFeed(book->feed());
  });
  pages->setFeed(_book->feed());
  letRecord(*pages->recorder());
  const auto& wrapper = navigation.controller().myTeskWrapper;
  wrapper->setLossObserver([window = QPointer(&navigation), book = _book](std::uint64_t dropped) {
    if (!window) return;
    book->noteDropped(dropped);
    window->setLoss(lossInWords(dropped));
  });
}

// Without a folder for it or the configuration to ask for there is no recording.
void Source::letRecord(RecorderModel& recorder) const {
  const std::string folder = RecordingsFolder::usualPath();
  const auto file = ResourceBundle::main().pathForResource("orb_test_lte", "deviceconfig");
  Bytes configuration = file ? contentOfFile(*file, kLargestConfiguration) : Bytes();
  if (folder.empty() || configuration.empty()) return;
  RecordingControl::Way way{_recordConnector, _bus, std::move(configuration)};
  recorder.setControl(std::make_unique<RecordingControl>(RecordingsFolder(folder), std::move(way)));
}

int Source::openWithin(const std::string& source) {
  sources::SourceError error;
  auto connector = connectWithin(source, conditionObserver(), error);
  if (!connector) {
    complain("qelwatch", error.message);
    return error.exitCode;
  }
  _connector = std::make_shared<ClosingConnector>(std::move(connector));
  _recordConnector = _connector;
  tesk::setConnector(_connector);
  return 0;
}

QString sourceInWords(const std::string& source) {
  if (source.empty()) return QStringLiteral("Baseband manager service");
  const QString text = QString::fromStdString(source);
  if (text.startsWith(kRecording)) return QStringLiteral("Recording ") + fileIn(text, kRecording);
  if (text.startsWith(kSimulated)) return QStringLiteral("Simulated modem");
  const QString place = fileIn(text, kDiagnostics);
  const bool isFile = text.startsWith(kDiagnostics) &&
                      !diagnostics::isPortName(text.mid(kDiagnostics.size()).toStdString());
  return isFile ? QStringLiteral("Raw log ") + place : QStringLiteral("Modem of this device");
}

}  // namespace qel

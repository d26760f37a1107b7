#include "app/Source.h"

#include <QtCore/QFileInfo>
#include <QtCore/QLocale>
#include <QtCore/QPointer>
#include <chrono>

#include "app/EventLoopWait.h"
#include "base/TerminalText.h"
#include "service/InProcessConnector.h"
#include "sources/diagnostics/port/PortName.h"
#include "tesk/Transport.h"

namespace qel {
namespace {

const QString kRecording = QStringLiteral("recording:");
constexpr std::chrono::milliseconds kPatienceOfASelfTest{5000};
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
  if (_connector) _connector->close();
}

int Source::open(const Options& options) {
  if (!options.source.empty()) return openWithin(options.source);
  _watch = std::make_shared<ServiceWatch>(options.bus);
  const auto patience = options.selfTest ? std::optional(kPatienceOfASelfTest) : std::nullopt;
  _connector = std::make_shared<ClosingConnector>(tesk::bus::makeBusConnector(
      {options.bus}, _watch->observer(),
      [patience] { return std::make_shared<EventLoopWait>(patience); }, _condition->observer()));
  tesk::setConnector(_connector);
  return 0;
}

void Source::showIn(Navigation& navigation) {
  if (_watch) _watch->showIn(navigation);
  _condition->showIn(navigation);
  const auto& wrapper = navigation.controller().myTeskWrapper;
  wrapper->setLossObserver([window = QPointer(&navigation)](std::uint64_t dropped) {
    if (window) window->setLoss(lossInWords(dropped));
  });
}

int Source::openWithin(const std::string& source) {
  sources::SourceError error;
  auto core = service::makeServiceCore(source, error);
  if (!core) {
    complain("qelwatch", error.message);
    return error.exitCode;
  }
  service::ConditionBook& book = core->condition();
  book.observe([&book, tell = _condition->observer()] { tell(inWords(book.current())); });
  _connector = std::make_shared<ClosingConnector>(service::makeInProcessConnector(std::move(core)));
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

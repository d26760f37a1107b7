#include "app/Source.h"

#include <QtCore/QFileInfo>
#include <iostream>

#include "service/InProcessConnector.h"
#include "tesk/Transport.h"

namespace qel {
namespace {

const QString kRecording = QStringLiteral("recording:");

}  // namespace

Source::~Source() {
  tesk::setConnector(nullptr);
  if (_connector) _connector->close();
}

int Source::open(const std::string& source) {
  service::SourceError error;
  auto connector = service::makeInProcessConnector(source, error);
  if (!connector) {
    std::cerr << "qelwatch: " << error.message << '\n';
    return error.exitCode;
  }
  _connector = std::make_shared<ClosingConnector>(std::move(connector));
  tesk::setConnector(_connector);
  return 0;
}

QString sourceInWords(const std::string& source) {
  const QString text = QString::fromStdString(source);
  if (!text.startsWith(kRecording)) return QStringLiteral("Simulated modem");
  const QString file = text.mid(kRecording.size()).section(u',', 0, 0);
  return QStringLiteral("Recording ") + QFileInfo(file).fileName();
}

}  // namespace qel

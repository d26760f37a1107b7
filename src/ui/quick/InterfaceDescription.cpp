#include "ui/quick/InterfaceDescription.h"

#include <QtQml/QQmlEngine>
#include <algorithm>

#include "base/FatalError.h"
#include "ui/screens/StandardScreens.h"

namespace qel {

QQmlComponent* CellPrototype::component() {
  if (!_component) _component = new QQmlComponent(qmlEngine(this), look, this);
  if (!_component->isReady()) fatalError(_component->errorString().toStdString());
  return _component;
}

CellPrototype* InterfaceDescription::find(const QString& identifier) const {
  const auto named = [&identifier](const auto* cell) { return cell->identifier == identifier; };
  const auto found = std::find_if(_cells.begin(), _cells.end(), named);
  return found == _cells.end() ? nullptr : *found;
}

QQmlComponent* InterfaceDescription::lookOf(const QString& identifier) const {
  CellPrototype* cell = find(identifier);
  return cell ? cell->component() : nullptr;
}

std::string InterfaceDescription::destinationOfCell(std::string_view cellIdentifier) const {
  const auto size = static_cast<qsizetype>(cellIdentifier.size());
  const CellPrototype* cell = find(QString::fromUtf8(cellIdentifier.data(), size));
  return cell ? cell->opens.toStdString() : std::string();
}

std::shared_ptr<TableViewController> InterfaceDescription::makeScreen(
    std::string_view className) const {
  return makeStandardScreen(className);
}

}  // namespace qel

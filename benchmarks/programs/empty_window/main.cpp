// The least that a Qt Quick program with something to read can be: what the viewer's start and
// memory are held against.
#include <QtGui/QGuiApplication>
#include <QtQml/QQmlApplicationEngine>

int main(int argc, char** argv) {
  const QGuiApplication application(argc, argv);
  QQmlApplicationEngine engine;
  engine.load(QStringLiteral("qrc:/EmptyWindow/EmptyWindow.qml"));
  return engine.rootObjects().isEmpty() ? 1 : QGuiApplication::exec();
}

// SIGINT and SIGTERM end the program as closing its window does.
#pragma once

#include <QtCore/QObject>

namespace qel {

// One, made after the application object.
class SignalQuit final : public QObject {
 public:
  SignalQuit();
  ~SignalQuit() override;
};

}  // namespace qel

// Where the viewer's values come from.
#pragma once

#include <QtCore/QString>
#include <memory>
#include <string>

#include "app/ClosingConnector.h"

namespace qel {

// The service on that source within this process, until this is gone. Main thread only.
class Source {
 public:
  Source() = default;
  ~Source();
  Source(const Source&) = delete;
  Source& operator=(const Source&) = delete;

  // Makes the client library connect to it. On failure nothing is changed, one line is written on
  // standard error and the answer is the exit code; else 0.
  int open(const std::string& source);

 private:
  std::shared_ptr<ClosingConnector> _connector;
};

// The source in words for the reader.
QString sourceInWords(const std::string& source);

}  // namespace qel

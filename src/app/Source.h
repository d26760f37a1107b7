// Where the viewer's values come from.
#pragma once

#include <QtCore/QString>
#include <memory>
#include <optional>
#include <string>

#include "app/ClosingConnector.h"
#include "app/ConditionLine.h"
#include "app/Options.h"
#include "app/ServiceWatch.h"
#include "feed/FeedBook.h"

namespace qel {

// The connection of the viewer, until this is gone: to the service on the bus, or to one on a
// source within this process. Main thread only.
class Source {
 public:
  Source() = default;
  ~Source();
  Source(const Source&) = delete;
  Source& operator=(const Source&) = delete;

  // Makes the client library connect there. On failure nothing is changed, one line is written on
  // standard error and the answer is the exit code; else 0.
  int open(const Options& options);

  // Shows in the window whether the service can be reached, how it is with the modem, and how much
  // came too fast.
  void showIn(Navigation& navigation);

 private:
  int openWithin(const std::string& source);
  // The book and the window's line hear of it.
  tesk::bus::ConditionObserver conditionObserver() const;
  void letRecord(RecorderModel& recorder) const;

  std::optional<std::string> _bus;  // nothing: a source within this process
  std::shared_ptr<ClosingConnector> _connector;
  std::shared_ptr<ClosingConnector> _recordConnector;
  const std::shared_ptr<ConditionLine> _condition = std::make_shared<ConditionLine>();
  std::shared_ptr<FeedBook> _book;
  std::shared_ptr<ServiceWatch> _watch;  // of the service on the bus
};

// The source in words for the reader.
QString sourceInWords(const std::string& source);

}  // namespace qel

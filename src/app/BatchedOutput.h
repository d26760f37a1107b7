// The viewer's standard output, by the batch.
#pragma once

#include <QtCore/QTimer>
#include <memory>

#include "base/DescriptorSink.h"

namespace qel {

// One, in the GUI thread, made after the application object. Lines to a file or a pipe are written
// together, the first after a rest at once; lines to a terminal one by one. A reader who takes
// nothing loses lines and holds nothing up.
class BatchedOutput {
 public:
  BatchedOutput();
  ~BatchedOutput();
  BatchedOutput(const BatchedOutput&) = delete;
  BatchedOutput& operator=(const BatchedOutput&) = delete;

 private:
  void flushWhenDue();

  QTimer _timer;
  std::shared_ptr<BatchingSink> _sink;
  std::shared_ptr<BatchedOutput*> _self;  // gone with this, for work that still waits
};

}  // namespace qel

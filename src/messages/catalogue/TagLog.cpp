#include "messages/catalogue/TagLog.h"

#include <utility>

#include "base/LogSink.h"

namespace qel {
namespace {

thread_local CountedTagLines* counting = nullptr;

}  // namespace

CountedTagLines::CountedTagLines() : _outer(std::exchange(counting, this)) {}
CountedTagLines::~CountedTagLines() { counting = _outer; }

void writeTagLine(std::string_view line) {
  if (counting) {
    ++counting->_count;
  } else {
    systemLog().write(line);
  }
}

}  // namespace qel

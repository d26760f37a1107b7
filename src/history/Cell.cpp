#include "history/Cell.h"

namespace qel {

bool Cell::isSameAs(const Cell& other) const {
  return technology == other.technology && channel == other.channel && code == other.code &&
         cellId == other.cellId;
}

}  // namespace qel

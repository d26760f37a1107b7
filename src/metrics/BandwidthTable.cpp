#include "metrics/BandwidthTable.h"

namespace qel {

BandwidthTable makeBandwidthTable() {
  return {{0, 1.4F}, {1, 3.0F}, {2, 5.0F}, {3, 10.0F}, {4, 15.0F}, {5, 20.0F}};
}

}  // namespace qel

// What happened, newest first, with a filter.
#pragma once

#include "tools/watch/View.h"
#include "ui/pages/HappeningsPage.h"

namespace qel::watch {

class HappeningsView final : public View {
 public:
  explicit HappeningsView(Desk& desk) : _desk(desk) {}

  Sheet sheet(Size size) override;
  bool take(const KeyPress& press) override;

 private:
  void nextFilter(int direction);

  Desk& _desk;
  HappeningsFilter _filter;
};

}  // namespace qel::watch

// Curves of the serving cell and its neighbours in block characters.
#pragma once

#include <optional>
#include <string>

#include "tools/watch/View.h"
#include "ui/pages/SignalsPage.h"

namespace qel::watch {

class SignalsView final : public View {
 public:
  explicit SignalsView(Desk& desk) : _desk(desk) {}

  Sheet sheet(Size size) override;
  bool take(const KeyPress& press) override;

 private:
  void addChart(const SignalsPage& page, const Chart& chart, Size size, Sheet& sheet) const;
  void readOffBy(int direction);

  Desk& _desk;
  SignalsRange _range;
  std::string _chart;                      // the large one; empty: the first
  std::optional<std::uint64_t> _readAtMs;  // where values are read off
};

}  // namespace qel::watch

// Everything that is known of one field.
#pragma once

#include <string>

#include "tools/watch/View.h"

namespace qel::watch {

struct FieldPlace {
  std::string technology;
  std::string category;
  int section = 0;
  int row = 0;
};

class FieldView final : public View {
 public:
  FieldView(Desk& desk, FieldPlace place) : _desk(desk), _place(std::move(place)) {}

  // Whether the row is a field.
  bool isThere() const;
  Sheet sheet(Size size) override;

 private:
  Desk& _desk;
  const FieldPlace _place;
};

}  // namespace qel::watch

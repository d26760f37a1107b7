// One row of a table, as a screen fills it.
#pragma once

#include <optional>
#include <string>

namespace qel {

// Whatever may start a segue.
class Sender {
 public:
  Sender() = default;
  Sender(const Sender&) = default;
  Sender& operator=(const Sender&) = default;
  virtual ~Sender() = default;
};

struct Label {
  std::optional<std::string> text;

  friend bool operator==(const Label&, const Label&) = default;
};

// A plain value. A prototype of the interface description says which labels a cell has; a label
// may be there without text.
class TableViewCell final : public Sender {
 public:
  std::string identifier;
  std::optional<Label> textLabel;
  std::optional<Label> detailTextLabel;

  TableViewCell() = default;
  TableViewCell(std::string reuseIdentifier, std::optional<Label> text, std::optional<Label> detail)
      : identifier(std::move(reuseIdentifier)),
        textLabel(std::move(text)),
        detailTextLabel(std::move(detail)) {}
};

}  // namespace qel

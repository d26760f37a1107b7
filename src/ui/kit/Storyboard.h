// The interface description: which screen comes first and where its rows lead.
#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "ui/kit/IndexPath.h"
#include "ui/kit/NavigationController.h"
#include "ui/kit/TableViewController.h"

namespace qel {

class Storyboard {
 public:
  virtual ~Storyboard() = default;

  // The class name of the screen that a tap on such a cell opens; empty: the cell opens none.
  virtual std::string destinationOfCell(std::string_view cellIdentifier) const = 0;

  // A new screen of that class with its cell prototypes, its view not loaded; none when the class
  // is unknown.
  virtual std::shared_ptr<TableViewController> makeScreen(std::string_view className) const = 0;
};

// Opens what the row of the top screen leads to: the screen prepares the new one, which gets the
// row's text as title and is pushed. Nothing happens for a row that leads nowhere or was not drawn.
bool followRow(NavigationController& navigation, const Storyboard& storyboard, IndexPath indexPath);

}  // namespace qel

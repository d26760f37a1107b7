// The screens by class name, with the cell prototypes that they dequeue.
#pragma once

#include <memory>
#include <string_view>

#include "ui/kit/TableView.h"
#include "ui/kit/TableViewController.h"

namespace qel {

// "LaunchView" and "FirstClickView" with a text label, "SecondClickView" with text and detail
// labels, "ThirdClickView" with none.
void registerStandardPrototypes(TableView& tableView);

// A new QelViewController, FirstLevelViewController, SecondLevelViewController or
// ThirdLevelViewController that has a table with the standard prototypes; its view is not loaded.
// Nothing for any other name.
std::shared_ptr<TableViewController> makeStandardScreen(std::string_view className);

}  // namespace qel

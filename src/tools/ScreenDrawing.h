// Category tables, drawn by the viewer's controller.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "ui/kit/TableSnapshot.h"

namespace qel::tools {

// The table's screen, reading the one store of the process.
std::shared_ptr<TableViewController> makeScreen(const std::string& technology,
                                                const std::string& category);

// The table for people: its name, then sections and rows in columns.
std::vector<std::string> tableLines(const std::string& key, const TableSnapshot& table);

}  // namespace qel::tools

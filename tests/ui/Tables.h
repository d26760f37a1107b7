// Small tables for tests of the toolkit, and screens ready to be drawn.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "ui/kit/TableSnapshot.h"
#include "ui/kit/TableViewController.h"
#include "ui/screens/SecondLevelViewController.h"
#include "ui/screens/StandardScreens.h"

namespace qel::testing {

// A screen of the given class with the standard prototypes.
template <typename Screen>
std::shared_ptr<Screen> makeScreen() {
  auto screen = std::make_shared<Screen>();
  screen->setTableView(std::make_shared<TableView>());
  registerStandardPrototypes(*screen->tableView());
  return screen;
}

// The category table of the process-wide store.
inline std::shared_ptr<SecondLevelViewController> categoryTable(std::string technology,
                                                                std::string category) {
  auto screen = makeScreen<SecondLevelViewController>();
  screen->firstSelection = std::move(technology);
  screen->seguedThroughRow = std::move(category);
  return screen;
}

// Sections as a test writes them: title, then rows of name and value.
struct FakeSection {
  std::optional<std::string> title;
  std::vector<std::pair<std::string, std::string>> rows;
};

// Shows what the test put in `sections`.
class FakeTable : public TableViewController {
 public:
  std::vector<FakeSection> sections;
  std::vector<std::string> calls;

  int numberOfSections() override {
    calls.emplace_back("sections");
    return static_cast<int>(sections.size());
  }
  std::optional<std::string> titleForHeaderInSection(int section) override {
    calls.push_back("title " + std::to_string(section));
    return sections[static_cast<std::size_t>(section)].title;
  }
  int numberOfRowsInSection(int section) override {
    calls.push_back("rows " + std::to_string(section));
    return static_cast<int>(sections[static_cast<std::size_t>(section)].rows.size());
  }
  TableViewCell& cellForRowAtIndexPath(IndexPath indexPath) override {
    calls.push_back("cell " + std::to_string(indexPath.section) + "," +
                    std::to_string(indexPath.row));
    const auto& row = sections[static_cast<std::size_t>(indexPath.section)]
                          .rows[static_cast<std::size_t>(indexPath.row)];
    TableViewCell& cell =
        requiredTableView().dequeueReusableCellWithIdentifier("SecondClickView", indexPath);
    cell.textLabel->text = row.first;
    cell.detailTextLabel->text = row.second;
    return cell;
  }
};

// The rows of all sections as "title|name|value"; "-" where there is none.
inline std::vector<std::string> linesOf(const TableSnapshot& snapshot) {
  std::vector<std::string> lines;
  for (const SectionSnapshot& section : snapshot.sections) {
    for (const RowSnapshot& row : section.rows) {
      lines.push_back(section.title.value_or("-") + "|" + row.text.value_or("-") + "|" +
                      row.detail.value_or("-"));
    }
  }
  return lines;
}

using Lines = std::vector<std::string>;

}  // namespace qel::testing

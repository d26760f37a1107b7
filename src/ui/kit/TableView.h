// A table's cells, between the controller that fills them and the face that shows them.
#pragma once

#include <functional>
#include <map>
#include <string>
#include <string_view>

#include "ui/kit/IndexPath.h"
#include "ui/kit/TableViewCell.h"

namespace qel {

// Main thread only. Owned by its controller. A table that no face shows is only marked on a
// reload, so a screen that was left costs nothing to keep up to date.
class TableView {
 public:
  using Face = std::function<void()>;

  // In place of an earlier prototype of the same identifier.
  void registerPrototype(TableViewCell prototype);

  // The cell of that row: the one it showed before, else a fresh copy of the prototype. An
  // identifier without prototype is a fatal error. Valid until the face is taken away.
  TableViewCell& dequeueReusableCellWithIdentifier(std::string_view identifier,
                                                   IndexPath indexPath);

  // The cell last drawn for that row, or nothing.
  const TableViewCell* cellForRowAtIndexPath(IndexPath indexPath) const;

  // Asks for everything to be drawn anew. The face is told once until it has drawn.
  void reloadData();

  // Called when there is something to draw; an empty function takes the face away, and the cells
  // with it: a screen that was left may stay for good. A table that was marked before tells its new
  // face at once.
  void setFace(Face face);

  bool needsDrawing() const { return _needsDrawing; }
  void drawn() { _needsDrawing = false; }

 private:
  std::map<std::string, TableViewCell, std::less<>> _prototypes;
  std::map<IndexPath, TableViewCell> _cells;
  Face _face;
  bool _needsDrawing = true;
};

}  // namespace qel

#include "sources/diagnostics/gsm/GsmChanges.h"

#include <algorithm>

namespace qel::diagnostics {
namespace {

void leaveCell(GsmPicture& picture) {
  picture.cell.reset();
  picture.broadcast = {};
  picture.idleLevel.reset();
  picture.callLevel.reset();
}

}  // namespace

void camp(Picture& picture, const GsmCell& cell) {
  changeTo(picture, Technology::gsm);
  enterCell(picture, cell);
}

void enterCell(Picture& picture, const GsmCell& cell) {
  if (!picture.technology) changeTo(picture, Technology::gsm);
  if (picture.gsm.cell == cell) return;
  leaveCell(picture.gsm);
  picture.gsm.cell = cell;
}

void enterArea(Picture& picture, const LocationArea& area) {
  if (!picture.technology) changeTo(picture, Technology::gsm);
  if (picture.gsm.cell && picture.gsm.cell->area != area) leaveCell(picture.gsm);
}

bool setDedicated(GsmPicture& picture, bool dedicated) {
  const bool changed = picture.dedicated && *picture.dedicated != dedicated;
  picture.dedicated = dedicated;
  if (!dedicated) picture.callLevel.reset();
  return changed;
}

void addNeighbour(GsmPicture& picture, const GsmNeighbour& neighbour) {
  if (!picture.neighbours) picture.neighbours.emplace();
  const GsmCamp* camp = picture.ownCamp();
  if (camp && camp->carrier.arfcn == neighbour.arfcn) return;
  auto& all = *picture.neighbours;
  const auto known = std::ranges::find(all, neighbour.arfcn, &GsmNeighbour::arfcn);
  if (known != all.end()) {
    const auto bsic = neighbour.bsic ? neighbour.bsic : known->bsic;
    *known = neighbour;
    known->bsic = bsic;
    return;
  }
  if (all.size() >= GsmPicture::kMostNeighbours) {
    all.erase(std::ranges::min_element(all, {}, &GsmNeighbour::timeMs));
  }
  all.push_back(neighbour);
}

}  // namespace qel::diagnostics

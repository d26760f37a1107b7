#include "sources/diagnostics/picture/Picture.h"

#include <utility>

namespace qel::diagnostics {
namespace {

// How far the connection had come is told until it begins again; which logs can be read holds for
// the modem.
void leave(LtePicture& lte) {
  LtePicture kept;
  kept.servingLog = lte.servingLog;
  kept.connection.rrc = lte.connection.rrc;
  kept.connection.failure = lte.connection.failure;
  kept.connection.configuredMs = lte.connection.configuredMs;
  lte = std::move(kept);
}

void leave(UmtsPicture& umts) {
  UmtsPicture kept;
  kept.connection = umts.connection;
  umts = std::move(kept);
}

}  // namespace

void changeTo(Picture& picture, Technology technology) {
  if (picture.technology == technology) return;
  picture.technology = technology;
  if (technology != Technology::lte) leave(picture.lte);
  if (technology != Technology::umts) leave(picture.umts);
  if (technology != Technology::gsm) picture.gsm = {};
}

}  // namespace qel::diagnostics

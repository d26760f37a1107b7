// What is known of the modem now, in plain values. What the port did not tell is absent.
#pragma once

#include <cstdint>
#include <optional>

#include "sources/diagnostics/picture/GsmPicture.h"
#include "sources/diagnostics/picture/LtePicture.h"
#include "sources/diagnostics/picture/NasPicture.h"
#include "sources/diagnostics/picture/SimPicture.h"
#include "sources/diagnostics/picture/UmtsPicture.h"

namespace qel::diagnostics {

enum class Technology : std::uint8_t { gsm, umts, lte };

struct Picture {
  std::optional<Technology> technology;  // of the serving cell
  LtePicture lte;
  UmtsPicture umts;
  GsmPicture gsm;
  NasPicture nas;
  SimPicture sim;
};

// The phone's serving cell is one of that technology: what belonged to cells of others, and to the
// connection there, holds no longer.
void changeTo(Picture& picture, Technology technology);

}  // namespace qel::diagnostics

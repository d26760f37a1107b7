// What is known of the modem on NAS.
#pragma once

#include "sources/diagnostics/picture/CommonPart.h"
#include "sources/diagnostics/picture/ConnectionsPart.h"
#include "sources/diagnostics/picture/ContextsPart.h"
#include "sources/diagnostics/picture/EmmPart.h"
#include "sources/diagnostics/picture/GmmPart.h"
#include "sources/diagnostics/picture/MmPart.h"

namespace qel::diagnostics {

struct NasPicture {
  CommonPart common;
  MmPart mm;
  GmmPart gmm;
  EmmPart emm;
  ConnectionsPart connections;
  ContextsPart contexts;
};

}  // namespace qel::diagnostics

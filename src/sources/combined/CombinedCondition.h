// How it is with a modem that two sources tell of, in one sentence.
#pragma once

#include "sources/SourceCondition.h"

namespace qel::sources {

// Whether a source in that condition may have values.
bool isThere(const SourceCondition& condition);

// ModemManager's word for the modem's state, the port's where there is none, and behind it what one
// of them lacks. A port that was never asked for is not missed.
SourceCondition combinedCondition(const SourceCondition& port, const SourceCondition& manager,
                                  bool isPortMissed);

}  // namespace qel::sources

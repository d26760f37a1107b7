// Pages as scripts read them.
#pragma once

#include "base/Value.h"
#include "history/Viewpoint.h"
#include "ui/pages/NowPage.h"
#include "ui/pages/SignalsPage.h"

namespace qel::tools {

// Every key is there, in the same order; null: not known.
Dictionary asJson(const NowPage& page);
// The page of that viewpoint.
Dictionary asJson(const SignalsPage& page, const Viewpoint& viewpoint);

}  // namespace qel::tools

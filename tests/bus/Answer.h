// What came of something that a user wanted of a bus.
#pragma once

namespace qel::testing {

enum Answer { allowed = 0, denied = 1, other = 2 };

}  // namespace qel::testing

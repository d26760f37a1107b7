// A while in which a thread says nothing on standard output.
#pragma once

namespace qel {

// For work that is done again, or aside, with parts that speak as they go: as long as one is there,
// standardOutput() of its thread drops every line.
class DroppedOutput {
 public:
  DroppedOutput();
  ~DroppedOutput();
  DroppedOutput(const DroppedOutput&) = delete;
  DroppedOutput& operator=(const DroppedOutput&) = delete;
};

}  // namespace qel

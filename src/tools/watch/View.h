// A page of the terminal's viewer.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "history/Viewpoint.h"
#include "tools/watch/Sheet.h"
#include "tools/watch/Terminal.h"
#include "ui/pages/Feed.h"
#include "ui/pages/Playback.h"
#include "ui/pages/RecordingControl.h"

namespace qel::watch {

// What all pages look at. Owned by the watch; main thread.
struct Desk {
  Playback& playback;
  const Feed& feed;
  RecordingControl* recorder;  // none: nothing can be recorded

  Viewpoint viewpoint() const { return playback.viewpoint(); }
};

// Main thread. Lives from when it is opened until it is left.
class View {
 public:
  virtual ~View() = default;
  // What it shows now, for a terminal of that size.
  virtual Sheet sheet(Size size) = 0;
  // The page that this row leads to; nothing: none.
  virtual std::unique_ptr<View> open(const std::string& /*rowId*/) { return nullptr; }
  // True when the key meant something here.
  virtual bool take(const KeyPress& /*press*/) { return false; }
  // Whether there is something new to show though no report came.
  virtual bool needsDrawing() const { return false; }
  // When it will read differently though nothing comes, as of the sheet last made; none: never.
  std::optional<std::uint64_t> changesAtMs() const { return _changesAtMs; }

  // Where it is scrolled to, and which row is chosen.
  std::size_t top = 0;
  std::string chosen;

 protected:
  std::optional<std::uint64_t> _changesAtMs;
};

}  // namespace qel::watch

// The recordings that are kept, and the one that is open.
#pragma once

#include "tools/watch/View.h"
#include "ui/pages/RecordingsPage.h"

namespace qel::watch {

class RecordingsView final : public View {
 public:
  explicit RecordingsView(Desk& desk);

  Sheet sheet(Size size) override;
  std::unique_ptr<View> open(const std::string& rowId) override;
  bool take(const KeyPress& press) override;
  bool needsDrawing() const override { return _hasMoreToRead; }

 private:
  void readOn();
  std::string recorded() const;

  Desk& _desk;
  RecordingsPage _page;
  bool _hasMoreToRead = true;
  std::string _growing;  // the file being recorded, as the page knows it
};

// What can be done with an open recording, wherever one is: true when the key meant that.
bool takeForPlayback(const KeyPress& press, Playback& playback);
// How it stands with it, for the foot of every page; empty without one.
std::vector<Row> playbackFoot(const Playback& playback);

}  // namespace qel::watch

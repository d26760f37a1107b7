// The recordings that are kept on this device.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "base/Clock.h"
#include "recording/RecordingsFolder.h"

namespace qel {

class RecordingDigest;

struct RecordingRow {
  std::string name;  // of the file; names the row in calls
  std::string path;
  std::string title;       // when it was begun, or the name of a file that was brought here
  std::string length;      // "0:12:34"; empty while it is not known
  std::string size;        // "1.2 MB"
  std::string cells;       // "14 cells"; empty while it is not known
  std::string fault;       // why it cannot be opened, or what is wrong with it
  bool isGrowing = false;  // being recorded: it cannot be deleted
};

struct RecordingsView {
  std::vector<RecordingRow> rows;  // newest first
  std::string emptyText;           // a sentence when there is none
  std::string totalText;           // "3 recordings, 12.4 MB of 1.0 GB"
  std::string undoText;            // "… deleted", while that can be undone
  std::string error;               // of the last thing that was tried
};

// Main thread only. Looks into the folder when it is told to, and reads a recording that it does
// not know in pieces, so that a window stays alive.
class RecordingsPage {
 public:
  explicit RecordingsPage(RecordingsFolder folder, const Clock& clock = systemClock());
  ~RecordingsPage();

  // Called after every change of the view.
  void setOnChanged(std::function<void()> onChanged) { _onChanged = std::move(onChanged); }

  // Looks into the folder again; `growing` is the recording being made, if any.
  void refresh(const std::string& growing = {});
  // Reads on where a length is not known yet; when they were begun is known first of all files.
  // False when there is nothing left to read.
  bool work();

  // Out of the list at once; the file goes for good with the next one, or with forget().
  void remove(const std::string& name);
  void undo();
  // The page is left: what was deleted here is gone now.
  void forget();

  const RecordingsView& view() const { return _view; }

 private:
  struct Known;
  void takeTitle();
  bool beginDigest();
  void describe();
  void changed();

  RecordingsFolder _folder;
  std::function<void()> _onChanged;
  std::string _growing;
  std::map<std::string, Known> _known;       // by name
  std::unique_ptr<RecordingDigest> _digest;  // of the one being read
  std::string _digested;                     // its name
  std::optional<std::string> _removed;
  RecordingsView _view;
};

}  // namespace qel

// Recordings that a window opens.
#pragma once

#include <sys/stat.h>

#include <memory>
#include <string>

#include "recording/RecordingReader.h"

namespace qel {

// Passes over bad lines. Nothing for what cannot be opened or is no regular file: a pipe would hold
// the window up.
inline std::unique_ptr<RecordingReader> openedRecording(const std::string& path,
                                                        RecordingFault& fault) {
  struct stat status {};
  if (::stat(path.c_str(), &status) == 0 && !S_ISREG(status.st_mode)) {
    fault = {RecordingFault::Kind::notOpened, path + ": not a regular file"};
    return nullptr;
  }
  return RecordingReader::open(path, RecordingReader::BadLines::skip, fault);
}

}  // namespace qel

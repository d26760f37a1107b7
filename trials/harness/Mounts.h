// File systems of this process and its children alone.
#pragma once

#include <string>

namespace qel::trials {

// Before any thread. From now on mounts are this process's own, where it may have some.
void separateMounts();

// An empty file system with room for so many bytes, there until the end of this object. Throws
// NotPossibleHere.
class SmallDisk {
 public:
  SmallDisk(std::string directory, std::size_t bytes);
  ~SmallDisk();
  SmallDisk(const SmallDisk&) = delete;
  SmallDisk& operator=(const SmallDisk&) = delete;

  // Takes all the room that is left, and gives it back.
  void fill() const;
  void empty() const;

 private:
  const std::string _directory;
};

// A file in the place of another, there until the end of this object. Throws NotPossibleHere.
class FileInPlace {
 public:
  FileInPlace(const std::string& file, std::string place);
  ~FileInPlace();
  FileInPlace(const FileInPlace&) = delete;
  FileInPlace& operator=(const FileInPlace&) = delete;

 private:
  const std::string _place;
};

}  // namespace qel::trials

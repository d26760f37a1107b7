#include "harness/Mounts.h"

#include <fcntl.h>
#include <sched.h>
#include <sys/mount.h>
#include <unistd.h>

#include <array>
#include <filesystem>

#include "harness/Trial.h"

namespace qel::trials {
namespace {

bool mountsAreOurs = false;

void requireOwnMounts() {
  if (!mountsAreOurs) throw NotPossibleHere("mounts of our own need root");
}

}  // namespace

void separateMounts() {
  mountsAreOurs = ::unshare(CLONE_NEWNS) == 0 &&
                  ::mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0;
}

SmallDisk::SmallDisk(std::string directory, std::size_t bytes) : _directory(std::move(directory)) {
  requireOwnMounts();
  std::filesystem::create_directories(_directory);
  const std::string options = "size=" + std::to_string(bytes);
  if (::mount("tmpfs", _directory.c_str(), "tmpfs", 0, options.c_str()) != 0) {
    throw NotPossibleHere("no file system in memory");
  }
}

SmallDisk::~SmallDisk() {
  ::umount2(_directory.c_str(), MNT_DETACH);
  std::error_code left;
  std::filesystem::remove(_directory, left);
}

void SmallDisk::fill() const {
  const std::string file = _directory + "/ballast";
  const int descriptor = ::open(file.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0600);
  constexpr std::array<char, 512> kPart{};
  while (::write(descriptor, kPart.data(), kPart.size()) > 0) {
  }
  ::close(descriptor);
}

void SmallDisk::empty() const { std::filesystem::remove(_directory + "/ballast"); }

FileInPlace::FileInPlace(const std::string& file, std::string place) : _place(std::move(place)) {
  requireOwnMounts();
  if (::mount(file.c_str(), _place.c_str(), nullptr, MS_BIND, nullptr) != 0) {
    throw NotPossibleHere("there is no " + _place + " to put another file over");
  }
}

FileInPlace::~FileInPlace() { ::umount2(_place.c_str(), MNT_DETACH); }

}  // namespace qel::trials

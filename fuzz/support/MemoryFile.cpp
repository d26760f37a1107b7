#include "fuzz/support/MemoryFile.h"

#include <sys/mman.h>
#include <unistd.h>

#include "base/DescriptorSink.h"
#include "fuzz/support/Law.h"

namespace qel::fuzz {

MemoryFile::MemoryFile(ByteView content) : _descriptor(::memfd_create("input", MFD_CLOEXEC)) {
  const std::string_view text(reinterpret_cast<const char*>(content.data()), content.size());
  law(_descriptor >= 0 && writeAll(_descriptor, text) == 0, "there is room for the input");
}

MemoryFile::~MemoryFile() { ::close(_descriptor); }

std::string MemoryFile::path() const { return "/proc/self/fd/" + std::to_string(_descriptor); }

}  // namespace qel::fuzz

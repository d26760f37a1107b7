// What the service finds where it kept its state.

#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "base/DescriptorSink.h"
#include "fuzz/support/Law.h"
#include "fuzz/support/Target.h"
#include "service/StateFile.h"

namespace qel::fuzz {
namespace {

// In memory where there is such a place; one for all runs of this process, and gone with it.
class Scratch {
 public:
  Scratch() {
    const bool inMemory = std::filesystem::exists("/dev/shm");
    std::string pattern = inMemory ? "/dev/shm/states.XXXXXX" : "/tmp/states.XXXXXX";
    law(::mkdtemp(pattern.data()) != nullptr, "there is room for the input");
    directory = pattern;
  }
  ~Scratch() { std::filesystem::remove_all(directory); }
  Scratch(const Scratch&) = delete;
  Scratch& operator=(const Scratch&) = delete;

  void put(const Bytes& content) const {
    std::FILE* file = std::fopen((directory + "/state").c_str(), "wb");
    law(file != nullptr, "there is room for the input");
    const std::size_t written = std::fwrite(content.data(), 1, content.size(), file);
    law(std::fclose(file) == 0 && written == content.size(), "there is room for the input");
  }

  std::string directory;
};

}  // namespace

void tryInput(Input input) {
  static const Scratch scratch;
  scratch.put(input.rest());
  service::StateFile file(scratch.directory);
  const service::KeptState found = file.load();
  file.save(found);
  law(file.load() == found, "what was saved is found again");
}

}  // namespace qel::fuzz

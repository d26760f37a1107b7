#include "support/Subprocess.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <stdexcept>
#include <system_error>

namespace qel::testing {
namespace {

// A file in memory only.
class MemoryFile {
 public:
  explicit MemoryFile(const char* name) : _descriptor(::memfd_create(name, MFD_CLOEXEC)) {
    if (_descriptor < 0) throw std::system_error(errno, std::generic_category(), name);
  }
  ~MemoryFile() { ::close(_descriptor); }
  MemoryFile(const MemoryFile&) = delete;
  MemoryFile& operator=(const MemoryFile&) = delete;

  int descriptor() const { return _descriptor; }

  void fill(const std::string& text) const {
    const ssize_t written = ::write(_descriptor, text.data(), text.size());
    if (written != static_cast<ssize_t>(text.size())) throw std::runtime_error("short write");
    ::lseek(_descriptor, 0, SEEK_SET);
  }

  std::string content() const {
    std::string text;
    char part[65536];
    ::lseek(_descriptor, 0, SEEK_SET);
    for (ssize_t count = 0; (count = ::read(_descriptor, part, sizeof part)) > 0;) {
      text.append(part, static_cast<std::size_t>(count));
    }
    return text;
  }

 private:
  int _descriptor;
};

}  // namespace

Outcome run(const std::string& program, const std::vector<std::string>& arguments,
            const std::string& input) {
  const MemoryFile in("in");
  const MemoryFile out("out");
  const MemoryFile err("err");
  in.fill(input);

  std::vector<std::string> words = arguments;
  words.insert(words.begin(), program);
  std::vector<char*> argv;
  for (std::string& word : words) argv.push_back(word.data());
  argv.push_back(nullptr);

  posix_spawn_file_actions_t actions;
  ::posix_spawn_file_actions_init(&actions);
  ::posix_spawn_file_actions_adddup2(&actions, in.descriptor(), STDIN_FILENO);
  ::posix_spawn_file_actions_adddup2(&actions, out.descriptor(), STDOUT_FILENO);
  ::posix_spawn_file_actions_adddup2(&actions, err.descriptor(), STDERR_FILENO);
  pid_t pid = 0;
  const int failed = ::posix_spawn(&pid, program.c_str(), &actions, nullptr, argv.data(), environ);
  ::posix_spawn_file_actions_destroy(&actions);
  if (failed != 0) throw std::system_error(failed, std::generic_category(), program);

  int status = 0;
  while (::waitpid(pid, &status, 0) < 0 && errno == EINTR) {
  }
  Outcome outcome;
  if (WIFEXITED(status)) outcome.exitCode = WEXITSTATUS(status);
  if (WIFSIGNALED(status)) outcome.signal = WTERMSIG(status);
  outcome.out = out.content();
  outcome.err = err.content();
  return outcome;
}

}  // namespace qel::testing

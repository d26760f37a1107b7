// first-frame RUNS PROGRAM [ARGUMENT…]: the time from the start of a Qt Quick program to its first
// frame, in ms, the median of the runs; then the processor time until then. The toolkit's own log
// tells when the frame is there.

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "programs/Figures.h"

namespace qel::benchmarks {
namespace {

struct Start {
  double elapsedMs = 0;
  double processorMs = 0;
};

double milliseconds(const timeval& time) {
  return static_cast<double>(time.tv_sec) * 1e3 + static_cast<double>(time.tv_usec) / 1e3;
}

// Reads the program's standard error until it tells of a frame. False when it ends without.
bool waitForFrame(int descriptor) {
  std::string heard;
  std::array<char, 4096> piece;
  while (heard.find("Frame rendered") == std::string::npos) {
    const ssize_t size = ::read(descriptor, piece.data(), piece.size());
    if (size <= 0) return false;
    heard.append(piece.data(), static_cast<std::size_t>(size));
  }
  return true;
}

bool run(char** words, Start& start) {
  std::array<int, 2> ends{};
  if (::pipe2(ends.data(), O_CLOEXEC) != 0) return false;
  posix_spawn_file_actions_t actions;
  ::posix_spawn_file_actions_init(&actions);
  ::posix_spawn_file_actions_adddup2(&actions, ends[1], STDERR_FILENO);
  ::posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
  const auto begun = Clock::now();
  pid_t process = 0;
  const bool spawned = ::posix_spawnp(&process, words[0], &actions, nullptr, words, environ) == 0;
  ::posix_spawn_file_actions_destroy(&actions);
  ::close(ends[1]);
  const bool drawn = spawned && waitForFrame(ends[0]);
  start.elapsedMs = Milliseconds(Clock::now() - begun).count();
  ::close(ends[0]);
  if (!spawned) return false;
  ::kill(process, SIGKILL);
  rusage used{};
  ::wait4(process, nullptr, 0, &used);
  start.processorMs = milliseconds(used.ru_utime) + milliseconds(used.ru_stime);
  return drawn;
}

}  // namespace
}  // namespace qel::benchmarks

int main(int argc, char** argv) {
  using namespace qel::benchmarks;
  const int runs = argc > 2 ? std::atoi(argv[1]) : 0;
  if (runs < 1) return 64;
  ::setenv("QT_LOGGING_RULES", "qt.scenegraph.time.renderloop=true", 1);
  std::vector<double> elapsed;
  std::vector<double> processor;
  for (int i = 0; i < runs; ++i) {
    Start start;
    if (!run(argv + 2, start)) {
      std::fprintf(stderr, "first-frame: %s drew nothing\n", argv[2]);
      return 1;
    }
    elapsed.push_back(start.elapsedMs);
    processor.push_back(start.processorMs);
  }
  std::printf("%.1f %.1f\n", median(elapsed), median(processor));
}

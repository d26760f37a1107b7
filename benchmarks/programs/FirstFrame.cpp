// first-frame RUNS PROGRAM [ARGUMENT…] [-- PROGRAM [ARGUMENT…]]…: for each program a line with the
// time from its start to its first frame and the processor time until then, in ms, the medians of
// the runs. The programs take turns, so that each sees the same machine. The toolkit's own log
// tells when the frame is there.

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "programs/Figures.h"

namespace qel::benchmarks {
namespace {

struct Starts {
  std::vector<double> elapsedMs;
  std::vector<double> processorMs;
};

// The words of each program, each ended by a null pointer.
std::vector<char**> programsOf(char** words) {
  std::vector<char**> programs = {words};
  for (; *words; ++words) {
    if (std::string_view(*words) != "--") continue;
    *words = nullptr;
    programs.push_back(words + 1);
  }
  return programs;
}

// Reads the program's standard error until it tells of a frame, which render loops begin with
// another letter. False when it ends without.
bool waitForFrame(int descriptor) {
  std::string heard;
  std::array<char, 4096> piece;
  while (heard.find("rame rendered") == std::string::npos) {
    const ssize_t size = ::read(descriptor, piece.data(), piece.size());
    if (size <= 0) return false;
    heard.append(piece.data(), static_cast<std::size_t>(size));
  }
  return true;
}

bool run(char** words, Starts& starts) {
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
  starts.elapsedMs.push_back(Milliseconds(Clock::now() - begun).count());
  ::close(ends[0]);
  if (!spawned) return false;
  ::kill(process, SIGKILL);
  rusage used{};
  ::wait4(process, nullptr, 0, &used);
  starts.processorMs.push_back(Milliseconds(timeOf(used.ru_utime) + timeOf(used.ru_stime)).count());
  return drawn;
}

}  // namespace
}  // namespace qel::benchmarks

int main(int argc, char** argv) {
  using namespace qel::benchmarks;
  const int runs = argc > 2 ? std::atoi(argv[1]) : 0;
  const auto programs = programsOf(argv + std::min(argc, 2));
  if (runs < 1) return 64;
  ::setenv("QT_LOGGING_RULES", "qt.scenegraph.time.renderloop=true", 1);
  std::vector<Starts> starts(programs.size());
  for (int i = 0; i < runs; ++i) {
    for (std::size_t k = 0; k < programs.size(); ++k) {
      if (run(programs[k], starts[k])) continue;
      std::fprintf(stderr, "first-frame: %s drew nothing\n", programs[k][0]);
      return 1;
    }
  }
  for (const Starts& of : starts) {
    std::printf("%.1f %.1f\n", median(of.elapsedMs), median(of.processorMs));
  }
}

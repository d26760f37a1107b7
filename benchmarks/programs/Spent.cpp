// spent COMMAND [WORD…]: runs it with its output thrown away and prints the processor time that it
// took, in ms, and the most memory that it held, in KB. Fails when the command does.

#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>

#include "programs/Figures.h"

int main(int argc, char** argv) {
  if (argc < 2) return 64;
  posix_spawn_file_actions_t actions;
  ::posix_spawn_file_actions_init(&actions);
  ::posix_spawn_file_actions_addopen(&actions, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
  pid_t process = 0;
  if (::posix_spawnp(&process, argv[1], &actions, nullptr, argv + 1, environ) != 0) return 127;
  int status = 0;
  rusage used{};
  ::wait4(process, &status, 0, &used);
  const qel::benchmarks::Milliseconds time =
      qel::benchmarks::timeOf(used.ru_utime) + qel::benchmarks::timeOf(used.ru_stime);
  std::printf("%.3f %ld\n", time.count(), used.ru_maxrss);
  return WIFEXITED(status) ? WEXITSTATUS(status) : 1;
}

// Does one work under callgrind, which counts its instructions: CountedWork NUMBER.
// Without an argument, lists the works.

#include <valgrind/callgrind.h>

#include <cstdlib>
#include <iostream>

#include "Works.h"
#include "base/LogSink.h"

int main(int argc, char** argv) {
  qel::setSystemLog(nullptr);
  const auto works = qel::bench::works();
  if (argc < 2) {
    for (const auto& work : works) {
      std::cout << work.group << '|' << work.who << '|' << qel::bench::kPayloads << '\n';
    }
    return EXIT_SUCCESS;
  }
  const auto number = std::strtoul(argv[1], nullptr, 10);
  if (number >= works.size()) return EXIT_FAILURE;
  const auto step = works[number].prepare();
  for (std::size_t i = 0; i < qel::bench::kPayloads; ++i) step(i);  // steady state
  CALLGRIND_TOGGLE_COLLECT;
  for (std::size_t i = 0; i < qel::bench::kPayloads; ++i) step(i);
  CALLGRIND_TOGGLE_COLLECT;
}

// Does one work under callgrind, which counts its instructions: CountedWork NUMBER.
// Without an argument, checks the peers and lists the works.

#include <valgrind/callgrind.h>

#include <cstdlib>
#include <iostream>

#include "Works.h"
#include "base/LogSink.h"
#include "peers/PeerWorks.h"

int main(int argc, char** argv) {
  qel::setSystemLog(nullptr);
  const auto works = qel::bench::works();
  if (argc < 2) {
    qel::bench::checkPeers();
    for (const auto& work : works) {
      std::cout << work.group << '|' << work.who << '|' << work.payloads->size() << '\n';
    }
    return EXIT_SUCCESS;
  }
  const auto number = std::strtoul(argv[1], nullptr, 10);
  if (number >= works.size()) return EXIT_FAILURE;
  const auto& work = works[number];
  const auto step = work.prepare(*work.payloads);
  for (std::size_t i = 0; i < work.payloads->size(); ++i) step(i);  // steady state
  CALLGRIND_TOGGLE_COLLECT;
  for (std::size_t i = 0; i < work.payloads->size(); ++i) step(i);
  CALLGRIND_TOGGLE_COLLECT;
}

// Does one work under callgrind, which counts its instructions: CountedWork [--recording FILE]…
// NUMBER. Without a number, checks the peers and lists the works.

#include <valgrind/callgrind.h>

#include <cstdlib>
#include <iostream>

#include "Mixes.h"
#include "Works.h"
#include "base/LogSink.h"
#include "peers/PeerWorks.h"

int main(int argc, char** argv) {
  qel::setSystemLog(nullptr);
  std::vector<char*> arguments(argv, argv + argc);
  const auto mixes = qel::bench::takeMixes(arguments);
  const auto works = qel::bench::works(mixes);
  if (arguments.size() < 2) {
    qel::bench::checkPeers(mixes);
    for (const auto& work : works) {
      std::cout << work.group << '|' << work.who << '|' << work.mix << '|' << work.pieces << '\n';
    }
    return EXIT_SUCCESS;
  }
  const auto number = std::strtoul(arguments[1], nullptr, 10);
  if (number >= works.size()) return EXIT_FAILURE;
  const auto& work = works[number];
  const auto step = work.prepare(*work.payloads);
  for (std::size_t i = 0; i < work.payloads->size(); ++i) step(i);  // steady state
  CALLGRIND_TOGGLE_COLLECT;
  for (std::size_t i = 0; i < work.payloads->size(); ++i) step(i);
  CALLGRIND_TOGGLE_COLLECT;
}

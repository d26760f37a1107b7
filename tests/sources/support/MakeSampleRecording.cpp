// Writes the recording that is kept beside the tests to the file that is named.
#include <zlib.h>

#include <cstdio>
#include <string>

#include "recording/EventLine.h"
#include "sources/support/SampleDrive.h"

int main(int argc, char** argv) {
  if (argc != 2) return 64;
  // Not the product's writer: it flushes every event, which triples the size.
  const gzFile file = ::gzopen(argv[1], "wb9");
  if (!file) return 74;
  for (const auto& event : qel::testing::sampleDrive()) {
    const std::string line = qel::eventLine(event) + "\n";
    ::gzwrite(file, line.data(), static_cast<unsigned>(line.size()));
  }
  if (::gzclose(file) != Z_OK) return 74;
  return 0;
}

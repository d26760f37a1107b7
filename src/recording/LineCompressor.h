// Gzip, with everything given so far readable after every line.
#pragma once

#include <string_view>

#include <zlib.h>

#include "base/Bytes.h"

namespace qel {

class LineCompressor {
 public:
  LineCompressor();
  ~LineCompressor();
  LineCompressor(const LineCompressor&) = delete;
  LineCompressor& operator=(const LineCompressor&) = delete;

  // What to append to the file for this text. Valid until the next call.
  const Bytes& line(std::string_view text) { return run(text, Z_SYNC_FLUSH); }
  const Bytes& end() { return run({}, Z_FINISH); }

 private:
  const Bytes& run(std::string_view text, int flush);

  z_stream _stream{};
  Bytes _out;
};

}  // namespace qel

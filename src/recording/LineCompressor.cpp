#include "recording/LineCompressor.h"

#include <array>

#include "base/FatalError.h"

namespace qel {

LineCompressor::LineCompressor() {
  constexpr int kGzipWindowBits = 15 + 16;
  constexpr int kMemoryLevel = 8;
  if (::deflateInit2(&_stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, kGzipWindowBits, kMemoryLevel,
                     Z_DEFAULT_STRATEGY) != Z_OK) {
    fatalError("out of memory for compression");
  }
}

LineCompressor::~LineCompressor() { ::deflateEnd(&_stream); }

const Bytes& LineCompressor::run(std::string_view text, int flush) {
  _out.clear();
  // zlib's interface lacks a const; it does not write to its input.
  _stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(text.data()));
  _stream.avail_in = static_cast<uInt>(text.size());
  std::array<std::uint8_t, 4096> piece;
  do {
    _stream.next_out = piece.data();
    _stream.avail_out = static_cast<uInt>(piece.size());
    ::deflate(&_stream, flush);
    _out.insert(_out.end(), piece.begin(), piece.end() - _stream.avail_out);
  } while (_stream.avail_out == 0);
  return _out;
}

}  // namespace qel

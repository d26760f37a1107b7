// Reads protocol-buffer wire format from a run of bytes.
#pragma once

#include <algorithm>
#include <cstdint>
#include <optional>
#include <string>

#include "base/Bytes.h"

namespace qel {

// The input stays the caller's and must outlive the reader. Once set, the error flag stays set.
// Whatever position and length are set to, nothing outside the input is read.
class PBDataReader {
 public:
  explicit PBDataReader(ByteView bytes)
      : _bytes(bytes.data()), _length(bytes.size()), _size(bytes.size()) {}

  // What may be read now. Nothing when the position is beyond the end.
  ByteView left() const {
    const std::uint64_t end = std::min(_length, _size);
    return _pos < end ? ByteView(_bytes + _pos, static_cast<std::size_t>(end - _pos)) : ByteView();
  }

  const std::uint8_t* const _bytes;
  std::uint64_t _length;  // end of what may be read now: the input, or the marked part of it
  std::uint64_t _pos = 0;
  bool _error = false;

 private:
  const std::uint64_t _size;  // of the input
};

// What PBReaderPlaceMark remembers, also when it fails: the end to go back to.
struct PBReaderMark {
  std::uint64_t length = 0;
};

// A varint of at most ten bytes. Ten bytes that all carry the top bit read as 0; running past the
// end sets the error flag and reads as 0.
std::uint64_t PBReaderReadVarint(PBDataReader& reader);

// A varint length and as many bytes. A length past the end sets the error flag and gives nothing.
std::optional<Bytes> PBReaderReadData(PBDataReader& reader);
std::optional<std::string> PBReaderReadString(PBDataReader& reader);

// Reads a varint length L and narrows the reader to the next L bytes until PBReaderRecallMark
// widens it again. False, with nothing narrowed, when that part runs past the end.
bool PBReaderPlaceMark(PBDataReader& reader, PBReaderMark& mark);
void PBReaderRecallMark(PBDataReader& reader, const PBReaderMark& mark);

// Skips the value of a field by its wire type: 0, 1, 2, 5, or 3 for a group with everything in it.
// False on any other wire type, on a group closed by another field's end, and past the end.
bool PBReaderSkipValueWithTag(PBDataReader& reader, std::uint32_t fieldNumber,
                              std::uint8_t wireType);

}  // namespace qel

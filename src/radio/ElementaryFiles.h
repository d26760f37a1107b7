// The elementary files of a SIM card: what they are called and what stands in them.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "base/Bytes.h"

namespace qel {

struct ElementaryFileName {
  std::uint32_t identifier;
  std::string_view name;     // "EF_IMSI"
  std::string_view content;  // "subscriber identity"
};

// Of 51.011, clause 10, and 31.102, clause 4; null: none that is known here.
const ElementaryFileName* findElementaryFile(std::uint32_t identifier);

// A part of a file's content, for a reader.
struct FilePart {
  std::string label;
  std::string text;
};

// Of the files whose layout is known here, as far as the content follows it; else nothing.
std::vector<FilePart> partsOfFile(std::uint32_t identifier, ByteView content);

}  // namespace qel

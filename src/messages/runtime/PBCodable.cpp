#include "messages/runtime/PBCodable.h"

#include "base/Rendering.h"

namespace qel {

std::string PBCodable::description() const {
  std::string text = "<";
  text += className();
  text += "> ";
  appendJson(text, dictionaryRepresentation());
  return text;
}

Bytes PBCodable::data() const {
  PBDataWriter writer;
  writeTo(writer);
  return writer.takeData();
}

}  // namespace qel

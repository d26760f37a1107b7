#include "messages/generator/Names.h"

#include <cctype>

namespace qel::generator {

std::string camelCase(std::string_view key) {
  std::string out;
  bool startOfWord = false;
  for (const char c : key) {
    if (c == '_') {
      startOfWord = true;
      continue;
    }
    const auto letter = static_cast<unsigned char>(c);
    if (out.empty()) {
      out += static_cast<char>(std::tolower(letter));
    } else {
      out += startOfWord ? static_cast<char>(std::toupper(letter)) : c;
    }
    startOfWord = false;
  }
  return out;
}

std::string capitalised(std::string name) {
  if (!name.empty()) {
    name[0] = static_cast<char>(std::toupper(static_cast<unsigned char>(name[0])));
  }
  return name;
}

std::string propertyName(const google::protobuf::FieldDescriptor& field) {
  std::string name = camelCase(field.name());
  if (field.is_repeated() && name.back() != 's') name += 's';
  return name;
}

std::string stem(const google::protobuf::FileDescriptor& file) {
  const std::string& name = file.name();
  return name.substr(0, name.rfind('.'));
}

std::string namesTable(const google::protobuf::EnumDescriptor& enumeration) {
  std::string name = "k";
  if (enumeration.containing_type()) name += enumeration.containing_type()->name();
  return name + enumeration.name() + "Names";
}

}  // namespace qel::generator

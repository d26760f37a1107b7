#include "messages/generator/FieldCode.h"

#include <google/protobuf/io/printer.h>
#include <google/protobuf/io/zero_copy_stream_impl_lite.h>

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <vector>

#include "messages/generator/Comments.h"
#include "messages/generator/Layout.h"
#include "messages/generator/Names.h"

namespace qel::generator {
namespace {

using google::protobuf::FieldDescriptor;
using Variables = std::map<std::string, std::string>;

[[noreturn]] void refuse(const FieldDescriptor& field, std::string_view why) {
  std::cerr << field.file()->name() << ": " << field.full_name() << ": " << why << '\n';
  std::exit(EXIT_FAILURE);
}

bool isScalar(const FieldDescriptor& field) {
  return !field.is_repeated() && field.type() != FieldDescriptor::TYPE_BYTES &&
         field.type() != FieldDescriptor::TYPE_STRING &&
         field.type() != FieldDescriptor::TYPE_MESSAGE;
}

struct Scalar {
  const char* type;
  const char* encoding;
};

Scalar scalarOf(const FieldDescriptor& field) {
  switch (field.type()) {
    case FieldDescriptor::TYPE_UINT64:
      return {"std::uint64_t", "uint64"};
    case FieldDescriptor::TYPE_UINT32:
      return {"std::uint32_t", "uint32"};
    case FieldDescriptor::TYPE_INT32:
      return {"std::int32_t", "int32"};
    case FieldDescriptor::TYPE_SINT32:
      return {"std::int32_t", "sint32"};
    case FieldDescriptor::TYPE_BOOL:
      return {"bool", "boolean"};
    case FieldDescriptor::TYPE_ENUM:
      return {"std::int32_t", "int32"};
    default:
      refuse(field, "a scalar is uint64, uint32, int32, sint32, bool or an enumeration");
  }
}

std::string render(const Variables& variables, const char* text) {
  std::string out;
  {
    google::protobuf::io::StringOutputStream stream(&out);
    google::protobuf::io::Printer printer(&stream, '$');
    printer.Print(variables, text);
  }
  return out;
}

// Class members stand two columns in, rows of the field table six.
constexpr std::size_t kMemberIndent = 2;
constexpr std::size_t kRowIndent = 6;

// One operation of the class: "head { body }".
struct Accessor {
  const char* head;
  const char* body;
};

struct Template {
  std::vector<Accessor> accessors;
  const char* member;
  const char* row;                       // the row's type
  std::vector<const char*> rowEnd = {};  // what follows number, key and member
};

const std::vector<Accessor> kPresence = {
    {"bool has$Name$() const", "return Presence::get(*this, $bit$);"},
    {"void setHas$Name$(bool present)", "Presence::set(*this, $bit$, present);"}};

const Template kScalar = {
    {{"$type$ $name$() const", "return _$name$;"},
     {"void set$Name$($type$ value)", "_$name$ = value;\n  setHas$Name$(true);"}},
    "$type$ _$name$ = {};\n",
    "ScalarField<Self, $type$, Encoding::$encoding$>",
    {"$bit$"}};

const Template kEnum = {
    {{"std::int32_t $name$() const", "return has$Name$() ? _$name$ : 0;"},
     {"void set$Name$(std::int32_t value)", "_$name$ = value;\n  setHas$Name$(true);"}},
    "std::int32_t _$name$ = {};\n",
    "EnumField<Self>",
    {"$bit$", "$names$"}};

const Template kObject = {{{"const $held$& $name$() const", "return _$name$;"},
                           {"void set$Name$($held$ value)", "_$name$ = std::move(value);"},
                           {"bool has$Name$() const", "return static_cast<bool>(_$name$);"}},
                          "$held$ _$name$;\n",
                          "$Kind$Field<$arguments$>"};

const Template kRepeatedMessage = {
    {{"const MessageList<$Nested$>& $name$() const", "return _$name$;"},
     {"void set$Name$(MessageList<$Nested$> values)", "_$name$ = std::move(values);"},
     {"void clear$Name$()", "_$name$.clear();"},
     {"void add$One$(std::shared_ptr<$Nested$> value)", "_$name$.push_back(std::move(value));"},
     {"std::size_t $name$Count() const", "return _$name$.size();"},
     {"const std::shared_ptr<$Nested$>& $one$AtIndex(std::size_t index) const",
      "return _$name$.at(index);"}},
    "MessageList<$Nested$> _$name$;\n",
    "RepeatedMessageField<Self, $Nested$>"};

const Template kPacked = {
    {{"const $type$* $name$() const", "return _$name$.list();"},
     {"std::size_t $name$Count() const", "return _$name$.count();"},
     {"$type$ $one$AtIndex(std::size_t index) const", "return _$name$.at(index);"},
     {"void add$One$($type$ value)", "$Family$Add(_$name$, value);"},
     {"void clear$Name$()", "$Family$Clear(_$name$);"},
     {"void set$Name$(const $type$* list, std::size_t count)",
      "$Family$Set(_$name$, list, count);"}},
    "$Family$ _$name$;\n",
    "PackedField<Self, $type$, Encoding::$encoding$>"};

std::string renderAccessors(const Variables& variables, const std::vector<Accessor>& accessors) {
  std::string code;
  for (const Accessor& accessor : accessors) {
    code += functionLines(render(variables, accessor.head), render(variables, accessor.body),
                          kMemberIndent);
  }
  return code;
}

std::string renderRow(const Variables& variables, const Template& chosen) {
  std::vector<std::string> values = {render(variables, "$number$"), render(variables, "\"$key$\""),
                                     render(variables, "&Self::_$name$")};
  for (const char* value : chosen.rowEnd) values.push_back(render(variables, value));
  return rowLines(render(variables, chosen.row), values, kRowIndent);
}

// The template for the field, with the variables that only this kind has.
const Template& chooseTemplate(const FieldDescriptor& field, Variables& variables) {
  if (field.type() == FieldDescriptor::TYPE_MESSAGE) {
    const std::string& nested = field.message_type()->name();
    variables["Nested"] = nested;
    if (field.is_repeated()) return kRepeatedMessage;
    variables["held"] = "std::shared_ptr<" + nested + ">";
    variables["Kind"] = "Message";
    variables["arguments"] = "Self, " + nested;
    return kObject;
  }
  if (field.is_repeated()) {
    const Scalar scalar = scalarOf(field);
    if (!field.is_packed()) refuse(field, "a repeated scalar must be packed");
    variables["type"] = scalar.type;
    variables["encoding"] = scalar.encoding;
    variables["Family"] =
        scalar.type == std::string_view("std::uint32_t") ? "PBRepeatedUInt32" : "PBRepeatedInt32";
    return kPacked;
  }
  if (isScalar(field)) {
    const Scalar scalar = scalarOf(field);
    variables["type"] = scalar.type;
    variables["encoding"] = scalar.encoding;
    if (field.type() != FieldDescriptor::TYPE_ENUM) return kScalar;
    variables["names"] = namesTable(*field.enum_type());
    return kEnum;
  }
  const bool text = field.type() == FieldDescriptor::TYPE_STRING;
  variables["held"] = text ? "std::optional<std::string>" : "std::optional<Bytes>";
  variables["Kind"] = text ? "String" : "Data";
  variables["arguments"] = "Self";
  return kObject;
}

}  // namespace

PresenceBits presenceBits(const google::protobuf::Descriptor& message) {
  std::vector<const FieldDescriptor*> scalars;
  for (int i = 0; i < message.field_count(); ++i) {
    if (isScalar(*message.field(i))) scalars.push_back(message.field(i));
  }
  std::ranges::sort(scalars, {}, [](const FieldDescriptor* field) {
    return std::pair(field->type() != FieldDescriptor::TYPE_UINT64, propertyName(*field));
  });
  PresenceBits bits;
  for (std::size_t i = 0; i < scalars.size(); ++i) bits[scalars[i]] = static_cast<int>(i);
  return bits;
}

FieldCode fieldCode(const FieldDescriptor& field, const PresenceBits& bits) {
  Variables variables;
  variables["Message"] = field.containing_type()->name();
  variables["number"] = std::to_string(field.number());
  variables["key"] = field.name();
  variables["name"] = propertyName(field);
  variables["Name"] = capitalised(variables["name"]);
  variables["one"] = camelCase(field.name());
  variables["One"] = capitalised(variables["one"]);
  if (const auto bit = bits.find(&field); bit != bits.end()) {
    variables["bit"] = std::to_string(bit->second);
  }
  const Template& chosen = chooseTemplate(field, variables);
  std::string accessors = commentOf(field) + renderAccessors(variables, chosen.accessors);
  if (isScalar(field)) accessors += renderAccessors(variables, kPresence);
  return {.accessors = std::move(accessors),
          .member = render(variables, chosen.member),
          .tableRow = renderRow(variables, chosen)};
}

}  // namespace qel::generator

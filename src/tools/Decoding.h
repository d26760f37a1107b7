// Payloads as qelctl decode prints them, one or many.
#pragma once

#include <string>

#include "base/Bytes.h"
#include "messages/catalogue/MetricMessages.h"
#include "tools/Output.h"

namespace qel::tools {

enum class Printed {
  dictionary,  // of the message, as JSON
  reencoded,   // the message encoded again, in hexadecimal
};

// Appends the message to the text. False, and nothing appended, when the bytes are damaged.
bool appendMessage(std::string& text, const MetricMessage& row, ByteView payload, Printed printed);

// Answers each line {"metric": N, "payload": "HEX"} of standard input with a line of JSON. One that
// is not as it should be is a ToolError.
void decodeBatch(Printed printed, Output& output);

}  // namespace qel::tools

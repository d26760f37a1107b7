// Where the viewer's values come from.
#pragma once

#include <QtCore/QString>
#include <string>

namespace qel {

// Makes the client library connect to that source, within this process. On failure nothing is
// changed, one line is written on standard error and the answer is the exit code; else 0.
int connectToSource(const std::string& source);

// The source in words for the reader.
QString sourceInWords(const std::string& source);

}  // namespace qel

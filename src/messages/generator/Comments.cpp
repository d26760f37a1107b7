#include "messages/generator/Comments.h"

#include <google/protobuf/descriptor.pb.h>

#include <vector>

namespace qel::generator {
namespace {

using google::protobuf::SourceLocation;

std::vector<std::string> linesOf(std::string_view comment) {
  std::vector<std::string> lines;
  while (!comment.empty()) {
    const auto end = comment.find('\n');
    lines.emplace_back(comment.substr(0, end));
    comment.remove_prefix(end == std::string_view::npos ? comment.size() : end + 1);
  }
  return lines;
}

}  // namespace

std::string commentLines(const SourceLocation& location) {
  std::string code;
  for (const std::string& line : linesOf(location.leading_comments)) code += "//" + line + '\n';
  return code;
}

std::string commentText(const SourceLocation& location) {
  const bool behind = !location.trailing_comments.empty();
  std::string text;
  bool startOfParagraph = true;
  for (const std::string& line :
       linesOf(behind ? location.trailing_comments : location.leading_comments)) {
    const auto start = line.find_first_not_of(' ');
    if (start == std::string::npos) {
      startOfParagraph = true;
      continue;
    }
    if (!text.empty()) text += startOfParagraph ? '\n' : ' ';
    text += line.substr(start);
    startOfParagraph = false;
  }
  return text;
}

SourceLocation headOf(const google::protobuf::FileDescriptor& file) {
  SourceLocation location;
  file.GetSourceLocation({google::protobuf::FileDescriptorProto::kSyntaxFieldNumber}, &location);
  return location;
}

}  // namespace qel::generator

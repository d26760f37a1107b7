// qelctl collect: a program of its own, so that a phone need not have a database's library.

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "tools/Commands.h"
#include "tools/ToolError.h"

namespace qel::tools {
namespace {

[[noreturn]] void become(const std::string& program, std::vector<std::string> words) {
  std::vector<char*> arguments;
  for (std::string& word : words) arguments.push_back(word.data());
  arguments.push_back(nullptr);
  ::execv(program.c_str(), arguments.data());
  if (errno == ENOENT) {
    throw ToolError(EX_UNAVAILABLE, program,
                    "not installed; it is in the package qelwatch-collect");
  }
  throw ToolError(EX_UNAVAILABLE, program, std::strerror(errno));
}

}  // namespace

void addCollectCommand(CLI::App& app, Action& chosen) {
  auto* command = app.add_subcommand("collect", "Store what phones send in a database");
  command->set_help_flag();  // the other program's
  command->prefix_command();
  command->callback([command, &chosen] {
    std::vector<std::string> words = command->remaining();
    words.insert(words.begin(), "qelctl collect");
    chosen = [words](Output&) {
      std::error_code error;
      const auto own = std::filesystem::read_symlink("/proc/self/exe", error);
      const auto folder = own.parent_path() / ".." / "libexec" / "qelwatch";
      become((folder / "qelctl-collect").lexically_normal().string(), words);
    };
  });
}

}  // namespace qel::tools

#include "harness/Program.h"

#include <unistd.h>

#include <fstream>
#include <sstream>

namespace qel::trials {
namespace {

// A shell sets the conditions and then becomes the program.
std::vector<std::string> wrapped(std::vector<std::string> words, const Conditions& conditions) {
  std::string script;
  if (!conditions.memoryGroup.empty()) script += "echo 0 >'" + conditions.memoryGroup + "'; ";
  if (conditions.fileBlocks >= 0) {
    script += "ulimit -f " + std::to_string(conditions.fileBlocks) + "; ";
  }
  if (script.empty()) return words;
  words.insert(words.begin(), {"/bin/sh", "-c", script + "exec \"$0\" \"$@\""});
  return words;
}

}  // namespace

Program::Program(const std::string& directory, std::string name, std::vector<std::string> words,
                 const Conditions& conditions)
    : _name(std::move(name)),
      _process({.words = wrapped(std::move(words), conditions),
                .environment = conditions.environment,
                .out = conditions.out.empty() ? directory + "/" + _name + ".out" : conditions.out,
                .err = directory + "/" + _name + ".err"}) {}

void Program::forgetWhatItSaid() const {
  const int done = ::truncate(_process.launch().out.c_str(), 0);
  static_cast<void>(done);  // a file that is not there yet says nothing either
}

bool Program::hasSaid(const std::string& text) const {
  return textOf(_process.launch().out).find(text) != std::string::npos;
}

std::string Program::errors() const { return textOf(_process.launch().err); }

std::vector<std::string> offScreen(const std::string& directory) {
  return {"QT_QPA_PLATFORM=offscreen", "XDG_CONFIG_HOME=" + directory,
          "XDG_RUNTIME_DIR=" + directory, "HOME=" + directory,
          "DBUS_SESSION_BUS_ADDRESS=unix:path=/nonexistent"};
}

std::string textOf(const std::string& file) {
  std::ostringstream text;
  text << std::ifstream(file).rdbuf();
  return text.str();
}

}  // namespace qel::trials

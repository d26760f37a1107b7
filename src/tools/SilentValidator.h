// Options that are checked without a word about it in the help.
#pragma once

#include <CLI/CLI.hpp>

namespace qel::tools {

// A validator that leaves the help text to the option.
template <class Checked>
CLI::Validator silent(Checked validator) {
  return validator.description("");
}

}  // namespace qel::tools

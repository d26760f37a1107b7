// The files of the repository, as text.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace qel::testing {

std::filesystem::path repository();

// Files below the folder (a path in the repository) with one of the endings, sorted.
std::vector<std::filesystem::path> filesBelow(const std::string& folder,
                                              const std::vector<std::string>& endings);

std::string contentOf(const std::filesystem::path& file);
std::vector<std::string> linesOf(const std::filesystem::path& file);

// The file's path in the repository.
std::string nameOf(const std::filesystem::path& file);

}  // namespace qel::testing

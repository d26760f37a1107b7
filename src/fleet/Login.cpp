#include "fleet/Login.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <string_view>

#include "base/FileContent.h"

namespace qel::fleet {
namespace {

constexpr std::size_t kLongestLogin = 4096;

std::string faultOf(const FileContent& file) {
  switch (file.fault) {
    case FileContent::Fault::unreadable:
      return std::strerror(file.error);
    case FileContent::Fault::notRegular:
      return "not a regular file";
    case FileContent::Fault::tooLarge:
      return "longer than " + std::to_string(kLongestLogin) + " bytes";
    case FileContent::Fault::none:
      break;
  }
  return {};
}

// Takes a line into the member that it names. False for any other line.
bool takeLoginLine(std::string_view line, Login& login) {
  for (const auto& [word, member] :
       {std::pair<std::string_view, std::string*>{"user ", &login.user},
        std::pair<std::string_view, std::string*>{"password ", &login.password}}) {
    if (!line.starts_with(word) || line.size() == word.size() || !member->empty()) continue;
    *member = line.substr(word.size());
    return true;
  }
  return false;
}

}  // namespace

bool isForOwnerAlone(const std::string& path, std::string& error) {
  struct stat about {};
  if (::stat(path.c_str(), &about) != 0) {
    error = path + ": " + std::strerror(errno);
    return false;
  }
  if (about.st_uid != ::geteuid() && about.st_uid != 0) {
    error = path + ": belongs to another user";
    return false;
  }
  if ((about.st_mode & 077U) != 0) {
    error = path + ": others may read it (chmod 600 changes that)";
    return false;
  }
  return true;
}

std::optional<Login> readLogin(const std::string& path, std::string& error) {
  if (!isForOwnerAlone(path, error)) return std::nullopt;
  const FileContent file = readFile(path, kLongestLogin);
  error = faultOf(file);
  if (!error.empty()) {
    error = path + ": " + error;
    return std::nullopt;
  }
  std::string_view rest(reinterpret_cast<const char*>(file.bytes.data()), file.bytes.size());
  Login login;
  for (int number = 1; !rest.empty(); ++number) {
    const auto end = rest.find('\n');
    const std::string_view line = rest.substr(0, end);
    rest.remove_prefix(end == std::string_view::npos ? rest.size() : end + 1);
    if (line.empty() || takeLoginLine(line, login)) continue;
    error =
        path + ", line " + std::to_string(number) + ": neither \"user NAME\" nor \"password TEXT\"";
    return std::nullopt;
  }
  if (!login.user.empty()) return login;
  error = path + ": names no user";
  return std::nullopt;
}

}  // namespace qel::fleet

// An authority of the test's own, and what it has signed.
#pragma once

#include <string>

namespace qel::testing {

// Files in the directory: of the authority, of the broker "localhost" and of a client.
class Certificates {
 public:
  Certificates(const std::string& directory, const std::string& name);

  std::string authority() const { return _path + "-ca.crt"; }
  std::string client() const { return _path + "-client.crt"; }
  std::string clientKey() const { return _path + "-client.key"; }
  // For a listener that lets nobody in whom the authority has not signed.
  std::string listenerLines() const;

 private:
  void sign(const std::string& who, const std::string& subject) const;

  const std::string _path;
};

}  // namespace qel::testing

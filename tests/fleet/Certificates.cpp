#include "fleet/Certificates.h"

#include <filesystem>
#include <stdexcept>
#include <vector>

#include "support/Subprocess.h"

namespace qel::testing {
namespace {

void openssl(const std::vector<std::string>& arguments) {
  const Outcome outcome = run("/usr/bin/openssl", arguments);
  if (outcome.exitCode != 0) throw std::runtime_error("openssl: " + outcome.err);
}

}  // namespace

Certificates::Certificates(const std::string& directory, const std::string& name)
    : _path(directory + "/" + name) {
  openssl({"req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes",
           "-days", "2", "-subj", "/CN=authority " + name, "-keyout", _path + "-ca.key", "-out",
           authority()});
  sign("broker", "/CN=localhost");
  sign("client", "/CN=phone");
}

void Certificates::sign(const std::string& who, const std::string& subject) const {
  const std::string file = _path + "-" + who;
  openssl({"req", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes", "-subj",
           subject, "-keyout", file + ".key", "-out", file + ".csr"});
  openssl({"x509", "-req", "-in", file + ".csr", "-CA", authority(), "-CAkey", _path + "-ca.key",
           "-CAcreateserial", "-days", "2", "-out", file + ".crt"});
  std::filesystem::permissions(file + ".key", std::filesystem::perms(0600));
}

std::string Certificates::listenerLines() const {
  return "cafile " + authority() + "\ncertfile " + _path + "-broker.crt\nkeyfile " + _path +
         "-broker.key\nrequire_certificate true\n";
}

}  // namespace qel::testing

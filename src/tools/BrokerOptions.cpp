#include "tools/BrokerOptions.h"

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <cerrno>
#include <cstring>

#include "tools/ToolError.h"

namespace qel::tools {
namespace {

void requireReadable(const std::string& path) {
  if (!path.empty() && ::access(path.c_str(), R_OK) != 0) {
    throw ToolError(EX_NOINPUT, path, std::strerror(errno));
  }
}

}  // namespace

void addBrokerOptions(CLI::App& command, BrokerOptions& options, const std::string& certificate) {
  fleet::LinkSettings& link = options.link;
  command.add_option("URL", options.url, "mqtt://HOST[:PORT] or, over TLS, mqtts://HOST[:PORT]")
      ->required();
  command
      .add_option("--login", options.loginFile,
                  "File with the lines \"user NAME\" and \"password TEXT\", for its owner alone")
      ->type_name("FILE");
  command
      .add_option("--ca", link.caFile,
                  "Who signs the broker's certificate, unless the system knows")
      ->type_name("FILE");
  auto* file = command.add_option("--cert", link.certificateFile, certificate)->type_name("FILE");
  auto* key =
      command.add_option("--key", link.keyFile, "Its key, for its owner alone")->type_name("FILE");
  file->needs(key);
  key->needs(file);
}

void checkBrokerOptions(BrokerOptions& options) {
  std::string why;
  const auto broker = fleet::brokerAddress(options.url, why);
  if (!broker) throw CLI::ValidationError(why);
  options.link.broker = *broker;
  const fleet::LinkSettings& link = options.link;
  if (!broker->isEncrypted && !(link.caFile.empty() && link.certificateFile.empty())) {
    throw CLI::ValidationError("--ca and --cert are for mqtts://");
  }
}

fleet::LinkSettings linkSettingsOf(const BrokerOptions& options) {
  fleet::LinkSettings link = options.link;
  for (const auto& path : {options.loginFile, link.caFile, link.certificateFile, link.keyFile}) {
    requireReadable(path);
  }
  std::string error;
  if (!options.loginFile.empty()) {
    link.login = fleet::readLogin(options.loginFile, error);
    if (!link.login) throw ToolError(EX_DATAERR, error);
  }
  if (!link.keyFile.empty() && !fleet::isForOwnerAlone(link.keyFile, error)) {
    throw ToolError(EX_DATAERR, error);
  }
  return link;
}

}  // namespace qel::tools

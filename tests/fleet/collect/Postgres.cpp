#include "fleet/collect/Postgres.h"

#include <pwd.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <sstream>
#include <stdexcept>

#include "support/Subprocess.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {
namespace {

namespace fs = std::filesystem;

// Of the newest version that is installed.
std::string binaries() {
  std::string newest;
  std::error_code error;
  for (const auto& entry : fs::directory_iterator("/usr/lib/postgresql", error)) {
    const std::string folder = entry.path().string() + "/bin/";
    if (fs::exists(folder + "postgres")) newest = std::max(newest, folder);
  }
  return newest;
}

constexpr const char* kUser = "nobody";

// The server refuses to run as root.
std::vector<std::string> asSomebody(std::vector<std::string> words) {
  if (::geteuid() == 0) {
    words.insert(words.begin(),
                 {"/usr/bin/setpriv", "--reuid", kUser, "--regid", "nogroup", "--clear-groups"});
  }
  return words;
}

Outcome runWords(std::vector<std::string> words, const std::string& input = "") {
  const std::string program = words.front();
  words.erase(words.begin());
  return run(program, words, input);
}

}  // namespace

bool Postgres::isThere() { return !binaries().empty(); }

Postgres::Postgres() {
  std::string pattern = (fs::temp_directory_path() / "qel-pg-XXXXXX").string();
  _folder = ::mkdtemp(pattern.data());
  if (const passwd* user = ::getpwnam(kUser); ::geteuid() == 0 && user) {
    if (::chown(_folder.c_str(), user->pw_uid, user->pw_gid) != 0) {
      throw std::runtime_error("no folder for the server");
    }
  }
  const Outcome made =
      runWords(asSomebody({binaries() + "initdb", "-D", _folder + "/data", "-A", "trust", "-U",
                           "owner", "-E", "UTF8", "--locale", "C.UTF-8", "--no-sync"}));
  if (made.exitCode != 0) throw std::runtime_error("initdb: " + made.err);
  start();
  for (const char* sql : {"CREATE DATABASE fleet", "CREATE ROLE collector LOGIN"}) {
    const Outcome outcome =
        run(binaries() + "psql", {"-h", _folder, "-U", "owner", "-qc", sql, "postgres"});
    if (outcome.exitCode != 0) throw std::runtime_error("psql: " + outcome.err);
  }
}

Postgres::~Postgres() {
  if (_server) kill();
  fs::remove_all(_folder);
}

void Postgres::start() {
  if (_server) {
    _server->start();
  } else {
    // What was committed must outlive the server, not the machine.
    _server = std::make_unique<ChildProcess>(Launch{
        .words = asSomebody({binaries() + "postgres", "-D", _folder + "/data", "-k", _folder, "-c",
                             "listen_addresses=", "-c", "fsync=off", "-c", "timezone=UTC"}),
        .out = _folder + "/log",
        .err = _folder + "/log"});
  }
  if (!eventually([this] {
        return run(binaries() + "pg_isready", {"-q", "-h", _folder}).exitCode == 0;
      })) {
    throw std::runtime_error("no database");
  }
}

void Postgres::kill() {
  _server->signal(SIGQUIT);
  _server->waitForEnd();
}

std::string Postgres::address(const std::string& user) const {
  return "host=" + _folder + " user=" + user + " dbname=fleet";
}

std::string Postgres::ask(const std::string& sql) const {
  const Outcome outcome = run(binaries() + "psql", {"-h", _folder, "-U", "owner", "-Atq", "-v",
                                                    "ON_ERROR_STOP=1", "-c", sql, "fleet"});
  if (outcome.exitCode != 0) throw std::runtime_error(sql + ": " + outcome.err);
  std::string out = outcome.out;
  if (out.ends_with('\n')) out.pop_back();
  return out;
}

std::unique_ptr<ChildProcess> Postgres::session(const std::string& sql) const {
  return std::make_unique<ChildProcess>(Launch{
      .words = {binaries() + "psql", "-h", _folder, "-U", "owner", "-Atq", "-c", sql, "fleet"},
      .out = _folder + "/session"});
}

std::vector<std::string> Postgres::lines(const std::string& sql) const {
  std::vector<std::string> all;
  std::istringstream stream(ask(sql));
  for (std::string line; std::getline(stream, line);) all.push_back(line);
  return all;
}

std::string Postgres::complaint(const std::string& user, const std::string& sql) const {
  return run(binaries() + "psql", {"-h", _folder, "-U", user, "-Atq", "-c", sql, "fleet"}).err;
}

}  // namespace qel::testing

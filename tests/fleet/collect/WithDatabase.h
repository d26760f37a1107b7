// qelctl collect between a broker and a database.
#pragma once

#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "fleet/Broker.h"
#include "fleet/Folder.h"
#include "fleet/collect/Postgres.h"
#include "support/Subprocess.h"
#include "tools/Qelctl.h"
#include "tools/RunningQelctl.h"

namespace qel::testing {

class WithDatabase : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!Postgres::isThere()) GTEST_SKIP() << "PostgreSQL is not installed";
    database = std::make_unique<Postgres>();
  }

  // Makes the tables, and lets the user "collector" be a collector.
  void prepare() const {
    const Outcome outcome =
        qelctl({"collect", "--prepare", "--database", database->address("owner")});
    ASSERT_EQ(outcome.exitCode, 0) << outcome.err;
    database->ask("GRANT qelwatch_collector TO collector");
  }

  std::vector<std::string> collecting(const std::string& name = "one",
                                      std::vector<std::string> more = {}) const {
    std::vector<std::string> words = {"collect", broker.url(), "--database", database->address(),
                                      "--name",  name,         "--every",    "50ms"};
    words.insert(words.end(), more.begin(), more.end());
    return words;
  }

  // A collector that the broker knows.
  std::unique_ptr<RunningQelctl> collector(const std::string& name = "one",
                                           std::vector<std::string> more = {}) const {
    auto program = std::make_unique<RunningQelctl>(collecting(name, std::move(more)));
    EXPECT_TRUE(eventually([&] { return program->hasSaid("connected as " + name); }))
        << program->err();
    return program;
  }

  // Each line is a message to the topic.
  void send(const std::string& topic, const std::string& lines) const {
    const Outcome sent = run("/usr/bin/mosquitto_pub",
                             {"-h", "127.0.0.1", "-p", std::to_string(broker.port()), "-V",
                              "mqttv5", "-q", "1", "-l", "-t", topic},
                             lines);
    ASSERT_EQ(sent.exitCode, 0) << sent.err;
  }

  // An RRC state that the phone "lab" reports under that number.
  static std::string rrcState(long number, long timeMs = 1'700'000'000'000) {
    return "{\"time_ms\": " + std::to_string(timeMs + number) +
           ", \"event\": \"metric\", \"kKeyMetricID\": 3952132, \"kKeyPayload\": "
           "\"COgHEAMg+gE=\", \"stream\": 7, \"number\": " +
           std::to_string(number) + "}\n";
  }
  static constexpr const char* kRrcTopic = "qelwatch/lab/KCellularLteRrcState";

  long events() const { return database->number("SELECT count(*) FROM qelwatch.event"); }
  bool haveCome(long count) const {
    return eventually([&] { return events() >= count; });
  }

  static std::string end(RunningQelctl& program) {
    program.signal(SIGTERM);
    EXPECT_EQ(program.waitForEnd(), 0) << program.err();
    return program.err();
  }

  Folder folder;
  Broker broker{folder.path()};
  std::unique_ptr<Postgres> database;
};

}  // namespace qel::testing

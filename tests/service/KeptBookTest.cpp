#include "service/KeptBook.h"

#include <gmock/gmock.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "messages/service_state.h"
#include "service/Limits.h"
#include "service/StateFile.h"
#include "service/support/Configuration.h"
#include "service/support/FakeKeeper.h"
#include "support/RecordingSink.h"

namespace qel::service {
namespace {

namespace fs = std::filesystem;
using testing::FakeKeeper;
using ::testing::HasSubstr;
using testing::HeldWaitClock;
using testing::KeptStates;

class StandingClock final : public Clock {
 public:
  std::uint64_t nowMs() const override { return timeMs; }
  std::uint64_t timeMs = 1'700'000'000'000;
};

class KeptBookTest : public ::testing::Test {
 protected:
  std::unique_ptr<KeptBook> book(KeptState found = {}) {
    return std::make_unique<KeptBook>(std::make_unique<FakeKeeper>(saved, std::move(found)), store,
                                      clock, waitClock);
  }
  // What is on the disk when the book is closed.
  KeptState lastSaved(std::unique_ptr<KeptBook> closing) const {
    closing.reset();
    const auto all = saved->all();
    return all.empty() ? KeptState{} : all.back();
  }

  // Of clients that were there just now, and one of nobody. A thousand bytes more have room.
  KeptState nearlyFull() const {
    KeptState state;
    state.configurations[kOfNobody] = {ofBytes(1600)};
    for (int i = 0; i < 32; ++i) {
      const std::string client = "client " + std::to_string(i / 8);
      state.configurations[i] = {ofBytes(4000), client};
      state.applicationOfClient[client] = {i, clock.timeMs};
    }
    return state;
  }
  // Of about so many.
  static Bytes ofBytes(std::size_t count) { return testing::triggers(count / 8, 0xFFFFFFFF); }
  static bool isRefused(KeptBook& book, std::int64_t application, const Bytes& payload) {
    std::string reason;
    auto configuration = DeviceConfiguration::fromPayload(payload, reason);
    return book.install("newcomer", application, payload, std::move(*configuration)).has_value();
  }

  static constexpr std::int64_t kOfNobody = 900;
  const Bytes payload = testing::configuration({{19972}});
  testing::CapturedSystemLog log;
  StandingClock clock;
  HeldWaitClock waitClock;
  ConfigurationStore store;
  std::shared_ptr<KeptStates> saved = std::make_shared<KeptStates>();
};

TEST_F(KeptBookTest, RemembersTheApplicationOfAClient) {
  auto first = book();
  first->opened("qelwatch");
  first->note("qelwatch", 2);
  const KeptState state = lastSaved(std::move(first));
  EXPECT_EQ(state.applicationOfClient.at("qelwatch"), (ClientUse{2, clock.timeMs}));
  EXPECT_EQ(book(state)->opened("qelwatch"), 2);
}

TEST_F(KeptBookTest, ForgetsTheClientThatWasThereLongestAgoWhenThereAreTooMany) {
  auto full = book();
  for (std::size_t i = 0; i < limits::kRememberedClients; ++i) {
    ++clock.timeMs;
    full->note("client " + std::to_string(i), 7);
  }
  EXPECT_EQ(full->opened("client 0"), 7) << "is there now";
  full->note("newcomer", 8);
  const KeptState state = lastSaved(std::move(full));
  EXPECT_EQ(state.applicationOfClient.size(), limits::kRememberedClients);
  EXPECT_TRUE(state.applicationOfClient.contains("client 0"));
  EXPECT_FALSE(state.applicationOfClient.contains("client 1"));
  EXPECT_TRUE(state.applicationOfClient.contains("newcomer"));
}

// Names of megabytes stayed in the state for ever.
TEST_F(KeptBookTest, LeavesOutWhatAnEarlierRunKeptBeyondTheLimits) {
  KeptState found;
  for (int i = 0; i < 100; ++i) found.configurations[i] = payload;
  found.configurations[200] = Bytes(limits::kPayloadBytes + 1);
  found.configurations[201] = Bytes{1, 2, 3};
  found.applicationOfClient["qelwatch"] = 2;
  found.applicationOfClient[std::string(8'000'000, 'x')] = 3;
  const KeptState state = lastSaved(book(found));
  EXPECT_EQ(state.configurations.size(), limits::kApplications);
  EXPECT_EQ(store.sizes().size(), limits::kApplications);
  EXPECT_EQ(state.applicationOfClient.size(), 1U);
  ASSERT_EQ(log.lines().size(), 1U);
  EXPECT_THAT(log.lines()[0], HasSubstr("39 entries are damaged or beyond the limits, forgotten"));
}

TEST_F(KeptBookTest, WritesNothingAfterAStartThatFoundAllInOrder) {
  KeptState found;
  found.configurations[2] = {payload, "qelwatch"};
  found.applicationOfClient["qelwatch"] = {2, clock.timeMs};
  book(found)->opened("qelwatch");
  EXPECT_TRUE(saved->all().empty());
  EXPECT_TRUE(log.lines().empty());
}

TEST_F(KeptBookTest, WritesACommandThatChangesNothingOnceAnHour) {
  KeptState found;
  found.configurations[2] = {payload, "qelwatch"};
  found.applicationOfClient["qelwatch"] = {2, clock.timeMs};
  auto quiet = book(found);
  std::string reason;
  for (int i = 0; i < 100; ++i) {
    quiet->note("qelwatch", 2);
    quiet->install("qelwatch", 2, payload, *DeviceConfiguration::fromPayload(payload, reason));
  }
  EXPECT_TRUE(lastSaved(std::move(quiet)) == KeptState{});
  auto later = book(found);
  clock.timeMs += 60 * 60 * 1000;
  later->note("qelwatch", 2);
  EXPECT_EQ(lastSaved(std::move(later)).applicationOfClient.at("qelwatch").usedMs, clock.timeMs);
}

// Those of clients long gone were forgotten even when that was not enough, and nobody was told.
TEST_F(KeptBookTest, NothingGivesWayToAConfigurationThatIsRefused) {
  auto full = book(nearlyFull());
  ASSERT_TRUE(store.find(kOfNobody));
  EXPECT_TRUE(isRefused(*full, 901, ofBytes(4000)));
  EXPECT_TRUE(store.find(kOfNobody));
  EXPECT_FALSE(store.find(901));
  EXPECT_FALSE(isRefused(*full, 902, ofBytes(900))) << "finds room beside it";
  EXPECT_TRUE(lastSaved(std::move(full)).configurations.contains(kOfNobody));
}

TEST_F(KeptBookTest, WhatGivesWayIsSavedAsForgotten) {
  auto full = book(nearlyFull());
  EXPECT_FALSE(isRefused(*full, 901, ofBytes(2400)));
  EXPECT_FALSE(store.find(kOfNobody));
  ASSERT_TRUE(saved->waitFor(1));
  EXPECT_FALSE(saved->all().front().configurations.contains(kOfNobody));
  EXPECT_TRUE(saved->all().front().configurations.contains(901));
}

TEST_F(KeptBookTest, NoMoreGivesWayThanIsNeeded) {
  KeptState found;
  for (int i = 0; i < 64; ++i) found.configurations[i] = {payload};
  auto full = book(found);
  EXPECT_FALSE(isRefused(*full, 901, payload));
  EXPECT_EQ(store.sizes().size(), limits::kApplications);
  EXPECT_FALSE(isRefused(*full, 5, ofBytes(4000))) << "in place of its own";
  EXPECT_EQ(store.sizes().size(), limits::kApplications);
}

TEST_F(KeptBookTest, ReadsAStateThatHasNoTimesAndNoOwners) {
  ServiceState old;
  old.setFormat(1);
  auto kept = std::make_shared<KeptConfiguration>();
  kept->setApplication(2);
  kept->setPayload(payload);
  old.addConfiguration(kept);
  auto client = std::make_shared<KeptClient>();
  client->setName("qelwatch");
  client->setApplication(2);
  old.addClient(client);
  const std::string directory =
      (fs::temp_directory_path() / ("qelbook" + std::to_string(::getpid()))).string();
  fs::create_directory(directory);
  const Bytes bytes = old.data();
  std::ofstream(directory + "/state", std::ios::binary)
      .write(reinterpret_cast<const char*>(bytes.data()),
             static_cast<std::streamsize>(bytes.size()));
  KeptBook restored(std::make_unique<StateFile>(directory), store, clock, waitClock);
  EXPECT_EQ(restored.opened("qelwatch"), 2);
  EXPECT_TRUE(store.find(2));
  fs::remove_all(directory);
}

TEST_F(KeptBookTest, TimesAndOwnersOutliveTheService) {
  const std::string directory =
      (fs::temp_directory_path() / ("qelbook" + std::to_string(::getpid()))).string();
  fs::create_directory(directory);
  KeptState state;
  state.configurations[-7] = {payload, "qelwatch"};
  state.applicationOfClient["qelwatch"] = {-7, 1'700'000'000'123};
  StateFile(directory).save(state);
  EXPECT_EQ(StateFile(directory).load(), state);
  fs::remove_all(directory);
}

}  // namespace
}  // namespace qel::service

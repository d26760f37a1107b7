#include <nlohmann/json.hpp>

#include "fleet/EventQueue.h"
#include "fleet/Folder.h"
#include "fleet/WireTap.h"
#include "fleet/WithBroker.h"

namespace qel::testing {
namespace {

using Json = nlohmann::json;

class QelctlPublish : public WithBroker {
 protected:
  Broker broker{directory};
  Subscriber subscriber{broker, file("received")};
};

TEST_F(QelctlPublish, sendsEveryEventWithItsNumber) {
  RunningQelctl publisher(publishing(broker.url()));
  ASSERT_TRUE(eventually([&] { return subscriber.numbers().size() > 200; })) << publisher.err();
  const std::string said = end(publisher);
  EXPECT_TRUE(said.starts_with("qelctl: " + broker.url() + ": connected as one, ")) << said;
  EXPECT_TRUE(said.ends_with(", identities hidden\n")) << said;
  EXPECT_NE(said.find(" events sent, 0 wait"), std::string::npos) << said;
  EXPECT_TRUE(eventually([&] { return subscriber.numbers().size() >= sentBy(said); })) << said;
  EXPECT_EQ(subscriber.numbers().size(), sentBy(said));
  EXPECT_TRUE(isWithoutGap(subscriber.events()));
  EXPECT_TRUE(std::ranges::is_sorted(subscriber.numbers()));
}

TEST_F(QelctlPublish, sendsLinesOfARecording) {
  RunningQelctl publisher(publishing(broker.url()));
  ASSERT_TRUE(eventually([&] { return subscriber.numbers().size() > 200; }));
  end(publisher);
  std::string recording;
  std::set<std::string> names;
  for (const Received& each : subscriber.received()) {
    if (!each.payload.starts_with("{\"time_ms\"")) continue;
    recording += each.payload + "\n";
    names.insert(each.topic);
    EXPECT_FALSE(each.isRetained);
  }
  EXPECT_TRUE(names.contains("qelwatch/one/KCellularLteRrcState"));
  const Outcome replayed = qelctl({"replay", write("got.jsonl", recording)});
  EXPECT_EQ(replayed.exitCode, 0) << replayed.err;
  EXPECT_NE(replayed.out.find("Current RRC state is"), std::string::npos);
}

TEST_F(QelctlPublish, sendsRecordsWithTheirUnits) {
  RunningQelctl publisher(publishing(broker.url(), {"--decoded"}));
  const std::string topic = "KCellularLteServingCellMeasurement";
  ASSERT_TRUE(eventually([&] { return !subscriber.last("one", topic).empty(); }));
  end(publisher);
  const Json event = Json::parse(subscriber.last("one", topic));
  EXPECT_EQ(event["event"], "metric");
  EXPECT_EQ(event["metric"], topic);
  EXPECT_GT(event["number"], 0);
  EXPECT_TRUE(event["record"].is_object());
  EXPECT_NE(event["units"].dump().find("\"dBm\""), std::string::npos) << event.dump();
  for (const auto& [key, unit] : event["units"].items()) {
    EXPECT_TRUE(unit.is_string() || unit.is_object()) << key;
  }
}

TEST_F(QelctlPublish, saysWhetherItIsThere) {
  const auto status = [&] { return subscriber.last("one", "status"); };
  {
    RunningQelctl publisher(publishing(broker.url()));
    ASSERT_TRUE(eventually([&] { return status() == "online"; })) << publisher.err();
    end(publisher);
    EXPECT_TRUE(eventually([&] { return status() == "offline"; }));
  }
  RunningQelctl publisher(publishing(broker.url()));
  ASSERT_TRUE(eventually([&] { return status() == "online"; })) << publisher.err();
  publisher.signal(SIGKILL);
  publisher.waitForEnd();
  EXPECT_TRUE(eventually([&] { return status() == "offline"; }));
  const Subscriber later(broker, file("later"), {"-i", "later"});
  EXPECT_TRUE(eventually([&] { return later.last("one", "status") == "offline"; }));
  const auto kept = later.received();
  const auto own = std::ranges::find(kept, "qelwatch/one/status", &Received::topic);
  ASSERT_NE(own, kept.end());
  EXPECT_TRUE(own->isRetained);
  EXPECT_GT(Json::parse(later.last("one", "queue"))["stream"], 0);
}

TEST_F(QelctlPublish, waitsForOthersOfABatch) {
  auto arguments = publishing(broker.url(), {"--batch", "20K"});
  *(std::ranges::find(arguments, "--every") + 1) = "1h";
  RunningQelctl publisher(arguments);
  ASSERT_TRUE(eventually([&] { return subscriber.numbers().size() > 20; })) << publisher.err();
  end(publisher);
  std::size_t bytes = 0;
  for (const Received& each : subscriber.received()) bytes += each.payload.size();
  EXPECT_GT(bytes, 20'000U);
  EXPECT_TRUE(isWithoutGap(subscriber.events()));
}

// Most brokers take but a few messages at a time.
TEST_F(QelctlPublish, sendsALongTopicUntilTheBrokerKnowsIt) {
  const Folder own;
  const Broker narrow(own.path(), "max_inflight_messages 5\nmax_topic_alias 4\n");
  const Subscriber receiver(narrow, file("narrow"));
  const WireTap tap(narrow.port());
  RunningQelctl publisher(publishing("mqtt://127.0.0.1:" + std::to_string(tap.port())));
  ASSERT_TRUE(eventually([&] { return receiver.newest() > 300; })) << publisher.err();
  const std::string said = end(publisher);
  EXPECT_TRUE(eventually([&] { return receiver.events().size() >= sentBy(said); })) << said;
  EXPECT_TRUE(isWithoutGap(receiver.events()));
  const std::string topic = "qelwatch/one/KCellularLteRrcState";  // the first one
  EXPECT_GT(std::ranges::count(receiver.received(), topic, &Received::topic), 5);
  const std::string wire = tap.sent();
  int sent = 0;
  for (auto at = wire.find(topic); at != std::string::npos; at = wire.find(topic, at + 1)) ++sent;
  EXPECT_GE(sent, 1);
  EXPECT_LE(sent, 5) << "what is under way before the first answer";
}

TEST_F(QelctlPublish, namesAPhoneByChance) {
  auto arguments = publishing(broker.url(), {"--duration", "0.5"});
  arguments.erase(std::ranges::find(arguments, "--phone"), std::ranges::find(arguments, "--every"));
  for (int i = 0; i < 2; ++i) EXPECT_EQ(qelctl(arguments).exitCode, 0);
  std::ifstream kept(file("state/phone"));
  std::string name;
  std::getline(kept, name);
  ASSERT_TRUE(name.starts_with("phone-")) << name;
  ASSERT_TRUE(eventually([&] { return subscriber.last(name, "status") == "offline"; }));
  for (const Received& each : subscriber.received()) {
    if (each.topic == "qelwatch/test/ready") continue;
    EXPECT_TRUE(each.topic.starts_with("qelwatch/" + name + "/")) << each.topic;
  }
}

TEST_F(QelctlPublish, sendsWhatWaitedWhileTheBrokerWasAway) {
  broker.save();
  broker.kill();
  {
    RunningQelctl publisher(publishing(broker.url()));
    ASSERT_TRUE(eventually([&] {
      return publisher.hasSaid(": Connection refused; events wait in the queue");
    })) << publisher.err();
    ASSERT_TRUE(eventually(
        [&] { return std::filesystem::file_size(file("state/publish.db-wal")) > 100'000; }));
    const std::string said = end(publisher);
    EXPECT_NE(said.find(": 0 events sent, "), std::string::npos) << said;
    EXPECT_EQ(said.find(", 0 wait"), std::string::npos) << said;
  }
  broker.start();
  RunningQelctl publisher(publishing(broker.url()));
  ASSERT_TRUE(eventually([&] { return subscriber.numbers().size() > 100; })) << publisher.err();
  const std::string said = end(publisher);
  EXPECT_TRUE(eventually([&] { return subscriber.events().size() >= sentBy(said); })) << said;
  EXPECT_TRUE(isWithoutGap(subscriber.events()));
}

TEST_F(QelctlPublish, dropsTheOldestBeyondItsSize) {
  broker.save();
  broker.kill();
  RunningQelctl publisher(publishing(broker.url(), {"--queue-size", "10K"}));
  ASSERT_TRUE(eventually([&] {
    return std::filesystem::exists(file("state/publish.db-wal")) &&
           std::filesystem::file_size(file("state/publish.db-wal")) > 400'000;
  }));
  broker.start();
  ASSERT_TRUE(eventually([&] { return subscriber.numbers().size() > 50; })) << publisher.err();
  const std::string said = end(publisher);
  EXPECT_NE(said.find(" dropped so far, beyond the limits of the queue"), std::string::npos)
      << said;
  EXPECT_TRUE(eventually([&] { return subscriber.events().size() >= sentBy(said); })) << said;
  EXPECT_GT(subscriber.events().begin()->first, 1U);
  std::string error;
  const auto queue = fleet::EventQueue::open(file("state"), {}, error);
  ASSERT_TRUE(queue) << error;
  // The newest ones may be among the dropped, while all that are older are under way.
  const auto missing = [&] { return queue->counts().newest - subscriber.events().size(); };
  EXPECT_TRUE(eventually([&] {
    return Json::parse(subscriber.last("one", "queue"))["dropped"] == missing();
  })) << subscriber.last("one", "queue")
      << missing();
}

TEST_F(QelctlPublish, losesNothingWhenItIsKilled) {
  const auto receiveMore = [&] {
    return eventually(
        [&, before = subscriber.newest()] { return subscriber.newest() > before + 20; });
  };
  for (int i = 0; i < 5; ++i) {
    RunningQelctl publisher(publishing(broker.url()));
    ASSERT_TRUE(receiveMore()) << publisher.err();
    publisher.signal(SIGKILL);
    publisher.waitForEnd();
  }
  RunningQelctl publisher(publishing(broker.url()));
  ASSERT_TRUE(receiveMore()) << publisher.err();
  EXPECT_NE(end(publisher).find(", 0 wait"), std::string::npos);
  EXPECT_TRUE(isWithoutGap(subscriber.events()));
}

TEST_F(QelctlPublish, losesNothingWhenTheBrokerIsKilled) {
  const SureSubscriber receivers(broker, file("sure"));
  RunningQelctl publisher(publishing(broker.url()));
  ASSERT_TRUE(receivers.receiveMore()) << publisher.err();
  broker.save();
  for (int i = 0; i < 3; ++i) {
    broker.kill();
    broker.start();
    ASSERT_TRUE(receivers.receiveMore()) << publisher.err();
  }
  EXPECT_TRUE(publisher.hasSaid("connected again, ")) << publisher.err();
  const std::string said = end(publisher);
  EXPECT_TRUE(eventually([&] { return receivers.events().size() >= sentBy(said); })) << said;
  EXPECT_EQ(receivers.events().size(), sentBy(said));
  EXPECT_TRUE(isWithoutGap(receivers.events()));
}

}  // namespace
}  // namespace qel::testing

#include <algorithm>
#include <set>

#include "messages/nas.h"
#include "messages/sim.h"
#include "metrics/MetricValidator.h"
#include "recording/RecordingReader.h"
#include "sources/simulated/Bcd.h"
#include "sources/simulated/Identities.h"
#include "tools/WithService.h"

namespace qel::testing {
namespace {

constexpr std::size_t kShortestTellingContent = 4;

// What a recording holds of somebody's identity.
struct Found {
  std::vector<Bytes> payloads;
  std::set<std::string> imsis;
  std::set<std::uint32_t> temporaryIdentities;
  std::set<std::string> addresses;
  std::vector<std::string> simFiles;
};

void noteAddress(Found& found, const std::optional<Bytes>& address) {
  if (address) found.addresses.insert(hexText(*address));
}

void noteBearers(Found& found, const KCellularActivatedBearerContexts& message) {
  for (const auto& bearer : message.bearerContexts()) {
    noteAddress(found, bearer->pdpAddr());
    noteAddress(found, bearer->primaryDnsAddr());
    noteAddress(found, bearer->secondaryDnsAddr());
  }
}

void noteSimFiles(Found& found, const KCellularSimCardFiles& message) {
  for (const auto& file : message.efLists()) found.simFiles.push_back(hexText(*file->content()));
}

void note(Found& found, std::int64_t metric, const Bytes& payload) {
  using V = MetricValidator;
  if (metric == V::K_CELLULAR_MM_INFO) {
    found.imsis.insert(hexText(*KCellularMmCommonInfo::initWithData(payload)->imsi()));
  } else if (metric == V::K_CELLULAR_MM_CTXT) {
    const auto context = KCellularMmContext::initWithData(payload);
    if (context->hasTmsi()) found.temporaryIdentities.insert(context->tmsi());
  } else if (metric == V::K_CELLULAR_GMM_CTXT) {
    const auto context = KCellularGmmContext::initWithData(payload);
    if (context->hasPTmsi()) found.temporaryIdentities.insert(context->pTmsi());
  } else if (metric == V::K_LTE_EMM_CTXT) {
    const auto guti = KCellularEmmContext::initWithData(payload)->guti();
    if (guti && guti->hasMTmsi()) found.temporaryIdentities.insert(guti->mTmsi());
  } else if (metric == V::K_CELLULAR_ACTIVE_BEARER) {
    noteBearers(found, *KCellularActivatedBearerContexts::initWithData(payload));
  } else if (metric == V::K_SIM_FILE_INFO) {
    noteSimFiles(found, *KCellularSimCardFiles::initWithData(payload));
  }
}

class QelctlPrivacy : public WithService {
 protected:
  void SetUp() override { ASSERT_TRUE(Client(bus, "first").waitForReachable(true)); }

  // Records until every kind of identity has come more than once.
  Found record(const std::string& name, std::vector<std::string> more = {}) {
    std::vector<std::string> arguments = {"record", file(name)};
    arguments.insert(arguments.end(), more.begin(), more.end());
    RunningQelctl running(words(arguments));
    Found found;
    EXPECT_TRUE(eventually([&] {
      found = read(file(name));
      return found.payloads.size() > 400 && !found.imsis.empty() && !found.addresses.empty() &&
             !found.simFiles.empty() && !found.temporaryIdentities.empty();
    }));
    running.signal(SIGTERM);
    EXPECT_EQ(running.waitForEnd(), 0);
    return read(file(name));
  }

  static Found read(const std::string& path) {
    Found found;
    RecordingFault fault;
    const auto reader = RecordingReader::open(path, RecordingReader::BadLines::fail, fault);
    if (!reader) return found;
    while (const auto event = reader->next()) {
      const Value* payload = event->entries.find("kKeyPayload");
      if (!payload) continue;
      found.payloads.push_back(*payload->asBytes());
      note(found, *event->entries.find("kKeyMetricID")->asInt64(), found.payloads.back());
    }
    return found;
  }

  static bool holds(const Found& found, const Bytes& secret) {
    return std::ranges::any_of(found.payloads, [&](const Bytes& payload) {
      return !std::ranges::search(payload, secret).empty();
    });
  }
};

TEST_F(QelctlPrivacy, findsNobodyInARecording) {
  const Found open = record("open.jsonl", {"--keep-identities"});
  const Found hidden = record("hidden.jsonl");
  const Bytes imsi = sources::encodedImsi(sources::kImsi);
  const Bytes subscriber(imsi.begin() + 4, imsi.end());  // beyond country and network
  const Bytes iccid = sources::swappedDigits(sources::kIccid);
  for (const Bytes& secret : {imsi, subscriber, iccid}) {
    EXPECT_TRUE(holds(open, secret)) << hexText(secret);
    EXPECT_FALSE(holds(hidden, secret)) << hexText(secret);
  }
  ASSERT_EQ(open.simFiles.size(), hidden.simFiles.size());
  for (std::size_t i = 0; i < open.simFiles.size(); ++i) {
    EXPECT_EQ(open.simFiles[i].size(), hidden.simFiles[i].size());
    EXPECT_NE(open.simFiles[i], hidden.simFiles[i]);
    const Bytes content = bytesFromHex(open.simFiles[i]).value();
    if (content.size() < kShortestTellingContent) continue;
    EXPECT_TRUE(holds(open, content));
    EXPECT_FALSE(holds(hidden, content)) << open.simFiles[i];
  }
  for (const std::string& address : open.addresses) {
    EXPECT_FALSE(hidden.addresses.contains(address)) << address;
    EXPECT_FALSE(holds(hidden, bytesFromHex(address).value())) << address;
  }
  for (const std::uint32_t identity : open.temporaryIdentities) {
    EXPECT_FALSE(hidden.temporaryIdentities.contains(identity)) << identity;
  }
}

TEST_F(QelctlPrivacy, givesEachValueOnePseudonymARecording) {
  const Found open = record("open.jsonl", {"--keep-identities"});
  const Found one = record("one.jsonl");
  const Found other = record("other.jsonl");
  ASSERT_EQ(open.imsis.size(), 1U);
  EXPECT_EQ(one.imsis.size(), 1U);
  EXPECT_EQ(other.imsis.size(), 1U);
  EXPECT_NE(one.imsis, other.imsis);
  EXPECT_EQ(one.addresses.size(), open.addresses.size());
  EXPECT_NE(one.addresses, other.addresses);
  EXPECT_NE(one.simFiles, other.simFiles);
}

TEST_F(QelctlPrivacy, keepsTheShapeOfWhatItHides) {
  const Found hidden = record("hidden.jsonl");
  for (const std::string& imsi : hidden.imsis) {
    EXPECT_TRUE(imsi.starts_with("0809101")) << imsi;  // length, type, 001 01
    EXPECT_EQ(imsi.find_first_not_of("0123456789"), std::string::npos) << imsi;
    EXPECT_EQ(imsi.size(), 18U);
  }
  for (const std::string& address : hidden.addresses) {
    EXPECT_TRUE(address.size() != 8 || address.starts_with("0a")) << address;
    EXPECT_TRUE(address.size() != 32 || address.starts_with("fd")) << address;
  }
  // A hidden recording still draws every screen.
  EXPECT_EQ(qelctl({"screens", file("hidden.jsonl")}).exitCode, 0);
}

}  // namespace
}  // namespace qel::testing

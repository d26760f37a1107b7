// The configuration that the viewer installs, as it was compiled.
#include <gtest/gtest.h>

#include <fstream>
#include <iterator>

#include "messages/catalogue/KBBMetricUtility.h"
#include "service/DeviceConfiguration.h"
#include "sources/simulated/Changes.h"

namespace qel {
namespace {

using namespace service;

std::optional<DeviceConfiguration> resource() {
  std::ifstream file(QEL_RESOURCE_DIR "/orb_test_lte.deviceconfig", std::ios::binary);
  EXPECT_TRUE(file.is_open());
  const Bytes payload{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  std::string reason;
  auto configuration = DeviceConfiguration::fromPayload(payload, reason);
  EXPECT_TRUE(configuration) << reason;
  return configuration;
}

TEST(ConfigurationResource, NamesEveryMetricOfTheCatalogueOnce) {
  const auto configuration = resource();
  ASSERT_TRUE(configuration);
  EXPECT_EQ(configuration->metricCount(), KBBMetricUtility::catalogue().size());
  for (const MetricName& metric : KBBMetricUtility::catalogue()) {
    EXPECT_EQ(configuration->periodMs(metric.identifier), 0U) << metric.name;
  }
}

TEST(ConfigurationResource, NamesTheTriggersOfTheModemAndOfQueries) {
  const auto configuration = resource();
  ASSERT_TRUE(configuration);
  EXPECT_TRUE(configuration->wantsTrigger(static_cast<std::int64_t>(sources::Trigger::cellChange)));
  EXPECT_TRUE(
      configuration->wantsTrigger(static_cast<std::int64_t>(sources::Trigger::carriersChanged)));
  EXPECT_TRUE(configuration->wantsTrigger(8323091));
  EXPECT_FALSE(configuration->wantsTrigger(0));
  EXPECT_FALSE(configuration->wantsTrigger(0x800000));
}

}  // namespace
}  // namespace qel

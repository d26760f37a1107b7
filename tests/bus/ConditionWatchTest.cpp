// What a service says of its modem, on its way to the reader.

#include <gtest/gtest.h>

#include <chrono>
#include <future>

#include "base/Utf8.h"
#include "bus/MoodyService.h"
#include "tesk/bus/BusConnector.h"

namespace qel::testing {
namespace {

using Mood = MoodyService::Mood;

// Megabytes went to the reader as they came.
TEST(ConditionWatch, TellsTheBeginningOfALongText) {
  const PrivateBus bus;
  MoodyService service(bus, Mood::answers, Mood::answers);
  std::string text = "M";
  for (int i = 0; i < 500'000; ++i) text += "ö";
  service.setCondition(text);
  std::promise<std::string> told;
  const auto transport =
      tesk::bus::makeBusConnector({bus.address()}, {}, {}, [&told](const std::string& line) {
        if (!line.empty()) told.set_value(line);
      })->connect("viewer", [](std::string_view, const tesk::Message&) {});
  auto line = told.get_future();
  ASSERT_EQ(line.wait_for(std::chrono::minutes(1)), std::future_status::ready);
  const std::string beginning = line.get();
  EXPECT_EQ(beginning, text.substr(0, 255));
  EXPECT_TRUE(isValidUtf8(beginning));
}

}  // namespace
}  // namespace qel::testing

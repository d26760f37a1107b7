// Whatever a source reports, what the service hands on can be drawn by every table. Reports without
// content used to end the viewer as soon as their table was opened.

#include <gmock/gmock.h>

#include <functional>
#include <map>
#include <memory>
#include <set>

#include "messages/Schemas.h"
#include "metrics/DispatchTable.h"
#include "metrics/MetricValidator.h"
#include "service/EventSubject.h"
#include "support/RecordingSink.h"
#include "tesk/Constants.h"
#include "ui/Tables.h"
#include "ui/screens/QelViewItems.h"

namespace qel::testing {
namespace {

using google::protobuf::FieldDescriptor;
using google::protobuf::Message;
using service::EventFault;
using sources::SourceEvent;

std::uint32_t metricOf(const DispatchRow& row) {
  return static_cast<std::uint32_t>(row.identifier - 0x3C0000);
}

sources::SourceEvent reportOf(std::int64_t identifier, std::optional<Bytes> payload) {
  sources::SourceEvent event{1000, tesk::kEventMetric, {{tesk::kKeyMetricID, identifier}}};
  if (payload) event.entries.append(tesk::kKeyPayload, std::move(*payload));
  return event;
}

// Every field present, lists with two entries.
void fill(Message& message, const FieldDescriptor& field) {
  const auto& fields = *message.GetReflection();
  switch (field.cpp_type()) {
    case FieldDescriptor::CPPTYPE_MESSAGE: {
      const bool isList = field.is_repeated();
      Message& part =
          isList ? *fields.AddMessage(&message, &field) : *fields.MutableMessage(&message, &field);
      for (int i = 0; i < part.GetDescriptor()->field_count(); ++i) {
        fill(part, *part.GetDescriptor()->field(i));
      }
      if (isList) fields.AddMessage(&message, &field)->CopyFrom(part);
      return;
    }
    case FieldDescriptor::CPPTYPE_STRING:
      return field.is_repeated() ? fields.AddString(&message, &field, "text")
                                 : fields.SetString(&message, &field, "text");
    case FieldDescriptor::CPPTYPE_ENUM:
      return field.is_repeated() ? fields.AddEnumValue(&message, &field, 1)
                                 : fields.SetEnumValue(&message, &field, 1);
    case FieldDescriptor::CPPTYPE_BOOL:
      return field.is_repeated() ? fields.AddBool(&message, &field, true)
                                 : fields.SetBool(&message, &field, true);
    case FieldDescriptor::CPPTYPE_INT32:
      return field.is_repeated() ? fields.AddInt32(&message, &field, INT32_MIN)
                                 : fields.SetInt32(&message, &field, INT32_MIN);
    case FieldDescriptor::CPPTYPE_UINT32:
      return field.is_repeated() ? fields.AddUInt32(&message, &field, UINT32_MAX)
                                 : fields.SetUInt32(&message, &field, UINT32_MAX);
    case FieldDescriptor::CPPTYPE_INT64:
      return field.is_repeated() ? fields.AddInt64(&message, &field, INT64_MIN)
                                 : fields.SetInt64(&message, &field, INT64_MIN);
    case FieldDescriptor::CPPTYPE_UINT64:
      return field.is_repeated() ? fields.AddUInt64(&message, &field, UINT64_MAX)
                                 : fields.SetUInt64(&message, &field, UINT64_MAX);
    default:
      FAIL() << field.full_name() << " has a type that this test does not fill";
  }
}

Bytes bytesOf(const Message& message) {
  const std::string text = message.SerializeAsString();
  return Bytes(text.begin(), text.end());
}

// The payload with each part missing in turn, the deepest too.
void eachWithoutAPart(const Message& whole, Message& part,
                      const std::function<void(Bytes)>& payload) {
  const auto& fields = *part.GetReflection();
  for (int i = 0; i < part.GetDescriptor()->field_count(); ++i) {
    const FieldDescriptor& field = *part.GetDescriptor()->field(i);
    const bool isMessage = field.cpp_type() == FieldDescriptor::CPPTYPE_MESSAGE;
    if (isMessage) {
      Message& inner = field.is_repeated() ? *fields.MutableRepeatedMessage(&part, &field, 0)
                                           : *fields.MutableMessage(&part, &field);
      eachWithoutAPart(whole, inner, payload);
    }
    const std::unique_ptr<Message> kept(part.New());
    kept->CopyFrom(part);
    fields.ClearField(&part, &field);
    payload(bytesOf(whole));
    part.CopyFrom(*kept);
  }
}

// Payloads of the metric: full, empty, absent, and without each of its parts.
void eachPayload(const DispatchRow& row, const std::function<void(std::optional<Bytes>)>& payload) {
  const auto message = stockMessage(schemaOf(findMetricMessage(metricOf(row))->className));
  for (int i = 0; i < message->GetDescriptor()->field_count(); ++i) {
    fill(*message, *message->GetDescriptor()->field(i));
  }
  payload(bytesOf(*message));
  payload(Bytes{});
  payload(std::nullopt);
  eachWithoutAPart(*message, *message, payload);
}

class DrawableReports : public ::testing::Test {
 protected:
  DrawableReports() {
    for (const auto& [technology, categories] : QelViewItems().firstLevelViewItems) {
      for (const std::string& category : categories) open(technology, category);
    }
    // Those that the tables know beside what the menu offers.
    open("LTE", "Component Carrier Info");
    open("UMTS", "Serving Cell Measurement");
    open("Connected", "Serv Cell Meas");
    open("GSM", "GPRS Config");
    open("GSM", "NAS  MM");
  }

  void open(const std::string& technology, const std::string& category) {
    screens.push_back(categoryTable(technology, category));
  }
  void drawAll() const {
    for (const auto& screen : screens) snapshotOf(*screen);
  }
  void showWithoutAsking(const sources::SourceEvent& event) const {
    MetricValidator::shared()->metricsDidUpdate(event.entries);
    drawAll();
  }

  CapturedStandardOutput out;
  CapturedSystemLog log;
  std::vector<std::shared_ptr<SecondLevelViewController>> screens;
};

TEST_F(DrawableReports, whatTheServiceHandsOnIsDrawnByEveryTable) {
  int shown = 0;
  for (const DispatchRow& row : dispatchTable()) {
    eachPayload(row, [&](std::optional<Bytes> payload) {
      const sources::SourceEvent event = reportOf(row.identifier, std::move(payload));
      EventFault fault;
      if (!examineEvent(event, fault)) return;
      showWithoutAsking(event);
      ++shown;
    });
  }
  EXPECT_GT(shown, 300);
}

TEST_F(DrawableReports, onlyReportsThatWouldEndTheViewerAreHeldBack) {
  std::map<std::uint32_t, int> heldBack;
  for (const DispatchRow& row : dispatchTable()) {
    eachPayload(row, [&](std::optional<Bytes> payload) {
      const sources::SourceEvent event = reportOf(row.identifier, std::move(payload));
      EventFault fault;
      if (examineEvent(event, fault)) return;
      EXPECT_TRUE(fault.withoutContent) << fault.reason;
      EXPECT_EQ(fault.reason.rfind("nothing to show in metric " + std::to_string(metricOf(row)), 0),
                0U);
      EXPECT_DEATH(showWithoutAsking(event), "fatal error: index out of range") << fault.reason;
      ++heldBack[metricOf(row)];
    });
  }
  // Each empty and absent; the two with lists also without the list.
  EXPECT_EQ(heldBack, (std::map<std::uint32_t, int>{{11788, 2},
                                                    {20330, 3},
                                                    {53249, 2},
                                                    {53250, 2},

                                                    {53260, 2},
                                                    {53506, 3},
                                                    {54027, 2}}));
}

}  // namespace
}  // namespace qel::testing

#include "fleet/collect/FleetDatabase.h"

#include <algorithm>
#include <chrono>
#include <map>
#include <pqxx/pqxx>
#include <pqxx/tablewriter>
#include <tuple>
#include <utility>

#include "base/IsoTime.h"
#include "fleet/collect/ArrayText.h"
#include "fleet/collect/FleetSchema.h"
#include "fleet/collect/SchemaLook.h"
#include "fleet/collect/WatchedConnection.h"

namespace qel::fleet {
namespace {

constexpr std::uint64_t kDayMs = 24ULL * 60 * 60 * 1000;
constexpr std::size_t kMostKnownPhones = 100'000;

using Events = std::vector<const NumberedEvent*>;

// By the key, the same for everybody: collectors that store the same do not wait for each other in
// a circle.
auto keyOf(const NumberedEvent& event) {
  return std::tuple<std::string_view, std::uint64_t, std::uint64_t, std::uint64_t>(
      event.phone, event.timeMs, event.stream, event.number);
}

template <class Kind>
std::vector<const Kind*> allOf(std::span<const PhoneMessage> messages) {
  std::vector<const Kind*> found;
  for (const PhoneMessage& message : messages) {
    if (const auto* each = std::get_if<Kind>(&message)) found.push_back(each);
  }
  return found;
}

std::string withRole(const std::string& address, std::chrono::milliseconds statement) {
  return address + "options='-c role=" + std::string(kCollectorRole) +
         " -c statement_timeout=" + std::to_string(statement.count()) +
         "ms -c timezone=UTC -c datestyle=ISO -c client_encoding=UTF8"
         " -c client_min_messages=warning'";
}

// What the content of a message is to blame for.
bool isOfContent(const std::string& state) {
  return state.starts_with("22") || state.starts_with("23") || state.starts_with("54");
}

// Those that were not there before, each once.
Events insertEvents(pqxx::work& transaction, const Events& events) {
  ArrayText phones, streams, numbers, times, metrics, faults, contents;
  for (const NumberedEvent* event : events) {
    phones.add(event->phone);
    streams.add(std::to_string(event->stream));
    numbers.add(std::to_string(event->number));
    times.add(isoTime(event->timeMs));
    metrics.add(event->metric);
    event->fault.empty() ? faults.addNull() : faults.add(event->fault);
    event->content.empty() ? contents.addNull() : contents.add(event->content);
  }
  const auto inserted = transaction.exec_params(
      "INSERT INTO qelwatch.event (phone, stream, number, time, metric, fault, content)"
      " SELECT * FROM unnest($1::text[], $2::bigint[], $3::bigint[], $4::timestamptz[],"
      " $5::text[], $6::text[], $7::jsonb[]) ON CONFLICT DO NOTHING"
      " RETURNING phone, (extract(epoch FROM time) * 1000)::bigint, stream, number",
      phones.text(), streams.text(), numbers.text(), times.text(), metrics.text(), faults.text(),
      contents.text());
  if (inserted.size() == events.size()) return events;
  std::map<decltype(keyOf(*events.front())), const NumberedEvent*> byKey;
  for (const NumberedEvent* event : events) byKey.try_emplace(keyOf(*event), event);
  Events fresh;
  for (const auto& row : inserted) {
    const std::string phone = row[0].as<std::string>();
    const auto found = byKey.find({phone, row[1].as<std::uint64_t>(), row[2].as<std::uint64_t>(),
                                   row[3].as<std::uint64_t>()});
    if (found != byKey.end()) fresh.push_back(found->second);
  }
  return fresh;
}

void appendEscaped(std::string& line, std::string_view text) {
  for (const char c : text) {
    switch (c) {
      case '\t':
        line += "\\t";
        break;
      case '\n':
        line += "\\n";
        break;
      case '\r':
        line += "\\r";
        break;
      case '\\':
        line += "\\\\";
        break;
      default:
        line += c;
    }
  }
}

// The library's newer stream takes only rows of as many columns as the compiler knows.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wdeprecated-declarations"
void copyRows(pqxx::work& transaction, const FleetTable& table, const Events& events) {
  std::vector<std::string> columns = {"phone", "stream", "number", "time"};
  for (const FleetColumn& column : table.columns()) columns.push_back(quotedName(column.name));
  pqxx::tablewriter writer(transaction, withSchema(table.name()), columns.begin(), columns.end());
  std::string line;
  for (const NumberedEvent* event : events) {
    const std::string start = event->phone + '\t' + std::to_string(event->stream) + '\t' +
                              std::to_string(event->number) + '\t' + isoTime(event->timeMs);
    for (const CopyRow& row : event->rows) {
      line = start;
      for (const CopyCell& cell : row) {
        line += '\t';
        cell ? appendEscaped(line, *cell) : void(line += "\\N");
      }
      writer.write_raw_line(line);
    }
  }
  writer.complete();
}
#pragma GCC diagnostic pop

// Each of a transaction with a time of its own: the newest counts.
void insertStatus(pqxx::work& transaction, const std::vector<const PhoneStatus*>& all) {
  if (all.empty()) return;
  ArrayText phones, words;
  for (const PhoneStatus* each : all) {
    phones.add(each->phone);
    words.add(each->status);
  }
  transaction.exec_params(
      "INSERT INTO qelwatch.status (phone, status, time) SELECT phone, status,"
      " now() + place * interval '1 microsecond'"
      " FROM unnest($1::text[], $2::text[]) WITH ORDINALITY AS said (phone, status, place)",
      phones.text(), words.text());
}

void insertQueues(pqxx::work& transaction, const std::vector<const PhoneQueue*>& all) {
  if (all.empty()) return;
  ArrayText phones, streams, dropped, lost, tooLarge, undecodable;
  for (const PhoneQueue* each : all) {
    phones.add(each->phone);
    streams.add(std::to_string(each->stream));
    dropped.add(std::to_string(each->dropped));
    lost.add(std::to_string(each->lost));
    tooLarge.add(std::to_string(each->tooLarge));
    undecodable.add(std::to_string(each->undecodable));
  }
  transaction.exec_params(
      "INSERT INTO qelwatch.queue (phone, stream, dropped, lost, too_large, undecodable)"
      " SELECT * FROM unnest($1::text[], $2::bigint[], $3::bigint[], $4::bigint[], $5::bigint[],"
      " $6::bigint[])",
      phones.text(), streams.text(), dropped.text(), lost.text(), tooLarge.text(),
      undecodable.text());
}

}  // namespace

FleetDatabase::FleetDatabase(const std::string& address, const AnswerPatience& patience,
                             const Clock& clock)
    : _clock(clock),
      _connection(
          std::make_unique<WatchedConnection>(withRole(address, patience.statement), patience)) {}

FleetDatabase::~FleetDatabase() = default;

std::unique_ptr<FleetDatabase> FleetDatabase::open(const std::string& address,
                                                   const AnswerPatience& patience,
                                                   DatabaseTrouble& trouble, const Clock& clock) {
  std::unique_ptr<FleetDatabase> database;
  const auto connect = [&] { database.reset(new FleetDatabase(address, patience, clock)); };
  if (!guarded(connect, trouble)) return nullptr;
  const auto check = [&] { database->checkLayout(); };
  if (!database->_connection->answersTo(check, trouble)) return nullptr;
  return database;
}

void FleetDatabase::checkLayout() {
  pqxx::work transaction(_connection->library());
  const FoundTables tables = foundTables(transaction);
  const std::string prepare = "; qelctl collect --prepare makes them so";
  if (tables.empty()) throw WrongLayout("it has no tables of this program" + prepare);
  const int layout = foundLayout(transaction);
  if (layout != kLayout) {
    throw WrongLayout("its tables have layout " + std::to_string(layout) + ", this program needs " +
                      std::to_string(kLayout) + (layout < kLayout ? prepare : ""));
  }
  for (const SchemaTable& table : schemaTables()) {
    const auto found = tables.find(table.name);
    for (const SchemaColumn& column : table.columns) {
      const bool isThere = found != tables.end() && found->second.contains(column.name) &&
                           found->second.at(column.name) == column.type;
      if (isThere) continue;
      throw WrongLayout(withSchema(table.name) + " has no " + column.name + " of type " +
                        column.type + prepare);
    }
  }
}

void FleetDatabase::makeDay(std::int64_t day) {
  if (_days.contains(day)) return;
  _connection->expectAnswer();
  pqxx::work transaction(_connection->library());
  transaction.exec_params("SELECT qelwatch.make_day(date '1970-01-01' + $1::integer)",
                          std::to_string(day));
  transaction.commit();
  _days.insert(day);
}

void FleetDatabase::makeDays(std::span<const PhoneMessage> messages) {
  const auto today = static_cast<std::int64_t>(_clock.nowMs() / kDayMs);
  if (std::exchange(_today, today) != today) _days.clear();
  makeDay(today);
  makeDay(today + 1);
  for (const NumberedEvent* event : allOf<NumberedEvent>(messages)) {
    const auto day = static_cast<std::int64_t>(event->timeMs / kDayMs);
    if (day >= today - kDaysBack && day <= today + kDaysAhead) makeDay(day);
  }
}

bool FleetDatabase::store(std::span<const PhoneMessage> messages, StoredCounts& counts,
                          DatabaseTrouble& trouble) {
  if (messages.empty()) return true;
  return _connection->answersTo(
      [&] {
        makeDays(messages);
        storeOrSplit(messages, counts);
      },
      trouble);
}

// Halves what the database does not take, until the message is alone that it does not take.
void FleetDatabase::storeOrSplit(std::span<const PhoneMessage> messages, StoredCounts& counts) {
  try {
    storeAll(messages, counts);
  } catch (const pqxx::sql_error& error) {
    if (!isOfContent(error.sqlstate())) throw;
    if (messages.size() == 1) {
      storeWithoutContent(messages.front(), counts);
      return;
    }
    const std::size_t half = messages.size() / 2;
    storeOrSplit(messages.first(half), counts);
    storeOrSplit(messages.subspan(half), counts);
  }
}

void FleetDatabase::storeWithoutContent(const PhoneMessage& message, StoredCounts& counts) {
  const auto* event = std::get_if<NumberedEvent>(&message);
  if (event) {
    NumberedEvent bare = *event;
    bare.rows.clear();
    bare.content.clear();
    bare.metric = "unknown";
    bare.fault = "the database does not take its content";
    const PhoneMessage alone = std::move(bare);
    try {
      storeAll(std::span(&alone, 1), counts);
      return;
    } catch (const pqxx::sql_error& error) {
      if (!isOfContent(error.sqlstate())) throw;
    }
  }
  ++counts.refused;
}

void FleetDatabase::storeAll(std::span<const PhoneMessage> messages, StoredCounts& counts) {
  Events events = allOf<NumberedEvent>(messages);
  std::ranges::sort(events, {}, [](const NumberedEvent* event) { return keyOf(*event); });
  std::set<std::string> newPhones;
  for (const NumberedEvent* event : events) {
    if (!_knownPhones.contains(event->phone)) newPhones.insert(event->phone);
  }
  _connection->expectAnswer();
  pqxx::work transaction(_connection->library());
  if (!newPhones.empty()) {
    ArrayText phones;
    for (const std::string& phone : newPhones) phones.add(phone);
    transaction.exec_params(
        "INSERT INTO qelwatch.phone (phone) SELECT unnest($1::text[]) ON CONFLICT DO NOTHING",
        phones.text());
  }
  const Events fresh = events.empty() ? events : insertEvents(transaction, events);
  std::map<const FleetTable*, Events> byTable;
  for (const NumberedEvent* event : fresh) {
    if (!event->rows.empty()) byTable[event->table].push_back(event);
  }
  for (const auto& [table, ofTable] : byTable) {
    _connection->expectAnswer();
    copyRows(transaction, *table, ofTable);
  }
  _connection->expectAnswer();
  insertStatus(transaction, allOf<PhoneStatus>(messages));
  insertQueues(transaction, allOf<PhoneQueue>(messages));
  transaction.commit();
  counts.stored += fresh.size();
  counts.again += events.size() - fresh.size();
  counts.faulty += static_cast<std::uint64_t>(
      std::ranges::count_if(fresh, [](const auto* event) { return !event->fault.empty(); }));
  if (_knownPhones.size() + newPhones.size() > kMostKnownPhones) _knownPhones.clear();
  _knownPhones.merge(newPhones);
}

}  // namespace qel::fleet

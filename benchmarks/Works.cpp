#include "Works.h"

#include <algorithm>
#include <deque>

#include "ListMix.h"
#include "OurWorks.h"
#include "ShapedPayloads.h"
#include "messages/catalogue/MetricMessages.h"
#include "peers/PeerWorks.h"

namespace qel::bench {
namespace {

struct Doer {
  const char* who;
  Step (*prepare)(const std::vector<Payload>& payloads);
};

using Doers = std::vector<Doer>;

struct Group {
  const char* name;
  Doers doers;
};

const std::vector<Group>& groups() {
  static const std::vector<Group> all = {
      {"decode a fresh message",
       {{"libprotobuf", decodeStock},
        {"protozero, stack", decodeProtozero},
        {"protozero, shared", keepProtozero},
        {"nanopb", decodeNanopb},
        {"ours", decodeOurs}}},
      {"decode, dictionary, visit every entry",
       {{"libprotobuf", entriesStock},
        {"protozero", entriesProtozero},
        {"protozero, a row of views", entriesFlat},
        {"ours", dictionaryOurs}}},
      {"decode, dictionary, visit, a later field at the end",
       {{"libprotobuf", onShaped<withUnknownField, entriesStock>},
        {"protozero", onShaped<withUnknownField, entriesProtozero>},
        {"ours", onShaped<withUnknownField, dictionaryOurs>}}},
      {"decode, dictionary, visit, fields in any order",
       {{"libprotobuf", onShaped<inAnyOrder, entriesStock>},
        {"protozero", onShaped<inAnyOrder, entriesProtozero>},
        {"ours", onShaped<inAnyOrder, dictionaryOurs>}}},
      {"encode a kept message",
       {{"libprotobuf", encodeStock},
        {"protozero", encodeProtozero},
        {"its structs, generated", encodeSized},
        {"nanopb", encodeNanopb},
        {"ours", encodeOurs}}},
      {"text of a dictionary",
       {{"fmt", textFmt}, {"of a struct, generated", textPlain}, {"ours", textOurs}}},
      {"time text, warm",
       {{"strftime", timeStrftime}, {"strftime, kept for a minute", timeKept}, {"ours", timeOurs}}},
      {"one metric event",
       {{"libprotobuf, message and line kept", eventStock},
        {"protozero, struct and line kept", eventProtozero},
        {"libprotobuf, std::map, streams", eventNaive},
        {"ours", eventOurs},
        {"ours, all lists looked at", eventLookedAt}}},
      {"one metric event, and what is kept of it",
       {{"ours without history", eventOurs}, {"ours with history", eventWithHistory}}},
  };
  return all;
}

struct Class {
  std::uint32_t metric;
  std::deque<Mix> mixes;  // what there is of the class in each
};

// In the order in which they first occur.
std::deque<Class> classesOf(const std::vector<Mix>& mixes) {
  std::deque<Class> classes;
  for (const Mix& mix : mixes) {
    for (const Payload& payload : mix.payloads) {
      auto found = std::ranges::find(classes, payload.metric, &Class::metric);
      if (found == classes.end()) found = classes.insert(found, {payload.metric, {}});
      auto& parts = found->mixes;
      if (parts.empty() || parts.back().name != mix.name) parts.push_back({mix.name, {}});
      parts.back().payloads.push_back(payload);
    }
  }
  return classes;
}

struct List {
  Mix mix;
  std::size_t elements;
};

const std::vector<List>& lists() {
  static const auto all = [] {
    std::vector<List> lists;
    for (const std::uint32_t length : {1U, 10U, 100U, 1000U, 10000U}) {
      auto payloads = listPayloads(length);
      const std::size_t elements = length * payloads.size();
      lists.push_back({{std::to_string(length), std::move(payloads)}, elements});
    }
    return lists;
  }();
  return all;
}

}  // namespace

std::vector<Work> works(const std::vector<Mix>& mixes) {
  std::vector<Work> works;
  const auto add = [&works](const std::string& group, const Doers& doers, const auto& parts) {
    for (const Doer& doer : doers) {
      for (const Mix& mix : parts) {
        works.push_back(
            {group, doer.who, mix.name, doer.prepare, &mix.payloads, mix.payloads.size()});
      }
    }
  };
  for (const Group& group : groups()) add(group.name, group.doers, mixes);

  static std::deque<Class> classes;
  classes = classesOf(mixes);
  const Doers decoders = {{"libprotobuf", decodeStock},
                          {"protozero, stack", decodeProtozero},
                          {"protozero, shared", keepProtozero},
                          {"ours", decodeOurs}};
  for (const Class& one : classes) {
    const auto name = findMetricMessage(one.metric)->className;
    add("decode " + std::string(name), decoders, one.mixes);
  }

  const Group ofLists = {"an element of a list",
                         {{"ours, decoded", decodeOurs},
                          {"ours, as dictionary", dictionaryOurs},
                          {"ours, encoded", encodeOurs},
                          {"ours, as text", textOurs},
                          {"ours, as event", eventOurs}}};
  for (const Doer& doer : ofLists.doers) {
    for (const List& list : lists()) {
      works.push_back(
          {ofLists.name, doer.who, list.mix.name, doer.prepare, &list.mix.payloads, list.elements});
    }
  }
  return works;
}

}  // namespace qel::bench

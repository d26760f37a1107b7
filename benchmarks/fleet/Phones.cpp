// fleet-phones URL RECORDING FIRST PHONES RATE SECONDS: so many phones in one process, the first of
// that number, each with a connection of its own, send events of the recording at RATE a second
// each. Says "connected" when all are, and begins at the end of its standard input; then prints
// each second how many were sent, how many of them the broker has, and its processor time in ms.

#include <poll.h>

#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <memory>
#include <span>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "fleet/BrokerLink.h"
#include "fleet/MetricNames.h"
#include "recording/EventLine.h"
#include "recording/RecordingReader.h"

namespace qel {
namespace {

using Clock = std::chrono::steady_clock;
using fleet::BrokerLink;

// An event without its time, number and end.
struct Template {
  std::string metric;
  std::string line;  // behind the time
};

std::vector<Template> templatesOf(const std::string& recording) {
  std::vector<Template> all;
  RecordingFault fault;
  const auto reader = RecordingReader::open(recording, RecordingReader::BadLines::skip, fault);
  while (auto event = reader ? reader->next() : std::nullopt) {
    const std::string line = eventLine(*event);
    all.push_back({fleet::metricNameOf(*event), line.substr(line.find(','))});
    all.back().line.pop_back();
  }
  return all;
}

std::uint64_t nowMs() {
  return static_cast<std::uint64_t>(std::chrono::duration_cast<std::chrono::milliseconds>(
                                        std::chrono::system_clock::now().time_since_epoch())
                                        .count());
}

class Phones {
 public:
  Phones(fleet::LinkSettings settings, std::vector<Template> templates)
      : _settings(std::move(settings)), _templates(std::move(templates)) {}

  // Some at a time: a broker lets few wait to be let in.
  bool connect(std::size_t first, std::size_t count) {
    while (_phones.size() < count) {
      const std::size_t before = _phones.size();
      while (_phones.size() < std::min(before + kTogether, count)) {
        if (!add(first + _phones.size())) return false;
      }
      if (!areOpen(before)) {
        std::fprintf(stderr, "fleet-phones: the broker does not answer everybody\n");
        return false;
      }
    }
    return true;
  }

  void send(std::size_t place) {
    Phone& phone = _phones[place];
    const Template& event = _templates[phone.next];
    phone.next = (phone.next + 1) % _templates.size();
    bool isTooLarge = false;
    phone.link->send("qelwatch/" + phone.name + "/" + event.metric,
                     "{\"time_ms\": " + std::to_string(nowMs()) + event.line +
                         ", \"stream\": " + std::to_string(_stream) +
                         ", \"number\": " + std::to_string(++phone.sent) + '}',
                     BrokerLink::Retained::no, isTooLarge);
    phone.link->turn(false);
    ++_sent;
  }

  void turn(int patienceMs) {
    ::poll(_waited.data(), _waited.size(), patienceMs);
    for (std::size_t i = 0; i < _phones.size(); ++i) {
      if (_waited[i].revents != 0 || _phones[i].link->wantsToWrite()) {
        _phones[i].link->turn(_waited[i].revents != 0);
      }
    }
  }

  std::uint64_t sent() const { return _sent; }
  std::uint64_t acknowledged() const { return _acknowledged; }

 private:
  static constexpr std::size_t kTogether = 50;

  struct Phone {
    std::string name;
    std::unique_ptr<BrokerLink> link;
    std::uint64_t sent = 0;
    std::size_t next = 0;
  };

  bool add(std::size_t number) {
    Phone phone;
    phone.name = "load-" + std::to_string(number);
    phone.next = number * 131 % _templates.size();
    _settings.client = "qelwatch-" + phone.name;
    fleet::LinkFailure failure;
    phone.link = BrokerLink::open(
        _settings, [this](int, const std::string& refusal) { _acknowledged += refusal.empty(); },
        failure);
    if (!phone.link) {
      std::fprintf(stderr, "fleet-phones: %s: %s\n", phone.name.c_str(), failure.why.c_str());
      return false;
    }
    _waited.push_back({phone.link->descriptor(), POLLIN, 0});
    phone.link->turn(false);
    _phones.push_back(std::move(phone));
    return true;
  }

  bool areOpen(std::size_t from) {
    const auto last = Clock::now() + std::chrono::seconds(60);
    const auto isOpen = [](const Phone& phone) {
      return phone.link->state() == BrokerLink::State::open;
    };
    while (Clock::now() < last) {
      const auto news = std::span(_phones).subspan(from);
      if (std::all_of(news.begin(), news.end(), isOpen)) return true;
      turn(10);
    }
    return false;
  }

  fleet::LinkSettings _settings;
  const std::vector<Template> _templates;
  const std::uint64_t _stream = nowMs() / 1000;
  std::vector<Phone> _phones;
  std::vector<pollfd> _waited;
  std::uint64_t _sent = 0;
  std::uint64_t _acknowledged = 0;
};

constexpr std::chrono::milliseconds kRest{20};

// Everybody in turn, as many each moment as are due.
void run(Phones& phones, std::size_t count, double rate, double seconds) {
  const auto begin = Clock::now();
  const auto elapsed = [begin] {
    return std::chrono::duration<double>(Clock::now() - begin).count();
  };
  const auto say = [&phones, spent = std::clock()](const char* when) {
    std::printf("%s %lu %lu %ld\n", when, static_cast<unsigned long>(phones.sent()),
                static_cast<unsigned long>(phones.acknowledged()),
                static_cast<long>((std::clock() - spent) / (CLOCKS_PER_SEC / 1000)));
    std::fflush(stdout);
  };
  int nextLine = 1;
  while (elapsed() < seconds ||
         (phones.acknowledged() < phones.sent() && elapsed() < seconds + 30)) {
    const double now = std::min(elapsed(), seconds);
    const auto due = static_cast<std::uint64_t>(now * rate * static_cast<double>(count));
    for (int some = 0; phones.sent() < due && some < 500; ++some) {
      phones.send(phones.sent() % count);
    }
    phones.turn(0);
    // Thousands of connections are looked at in one go, not once for each answer.
    if (phones.sent() >= due) std::this_thread::sleep_for(kRest);
    if (elapsed() < nextLine) continue;
    say(std::to_string(nextLine).c_str());
    ++nextLine;
  }
  say("end");
}

}  // namespace
}  // namespace qel

int main(int argc, char** argv) {
  using namespace qel;
  std::string why;
  const auto broker = argc == 7 ? fleet::brokerAddress(argv[1], why) : std::nullopt;
  if (!broker) {
    std::fprintf(stderr, "usage: fleet-phones URL RECORDING FIRST PHONES RATE SECONDS\n");
    return 64;
  }
  fleet::LinkSettings settings;
  settings.broker = *broker;
  const auto first = static_cast<std::size_t>(std::strtoul(argv[3], nullptr, 10));
  const auto count = static_cast<std::size_t>(std::strtoul(argv[4], nullptr, 10));
  auto templates = templatesOf(argv[2]);
  if (templates.empty() || count == 0) {
    std::fprintf(stderr, "fleet-phones: nothing to send\n");
    return 65;
  }
  Phones phones(settings, std::move(templates));
  if (!phones.connect(first, count)) return 69;
  std::printf("connected\n");
  std::fflush(stdout);
  while (std::getchar() != EOF) {
  }
  run(phones, count, std::strtod(argv[5], nullptr), std::strtod(argv[6], nullptr));
  return phones.acknowledged() == phones.sent() ? 0 : 74;
}

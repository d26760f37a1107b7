// What qelctl makes of many payloads on its standard input.

#include <fcntl.h>
#include <poll.h>
#include <spawn.h>
#include <sys/wait.h>

#include <array>

#include "tools/Qelctl.h"

namespace qel::testing {
namespace {

constexpr const char* kLine = "{\"metric\": 19972, \"payload\": \"08e8071003\"}";
constexpr const char* kAnswer = "{\"timestamp\": 1000, \"state\": \"KLTE_RRC_STATE_CONNECTED\"}";

// Whose questions and answers go to and fro.
class Conversation {
 public:
  Conversation() {
    std::array<int, 2> in{};
    std::array<int, 2> out{};
    EXPECT_EQ(::pipe2(in.data(), O_CLOEXEC), 0);
    EXPECT_EQ(::pipe2(out.data(), O_CLOEXEC), 0);
    posix_spawn_file_actions_t actions;
    ::posix_spawn_file_actions_init(&actions);
    ::posix_spawn_file_actions_adddup2(&actions, in[0], STDIN_FILENO);
    ::posix_spawn_file_actions_adddup2(&actions, out[1], STDOUT_FILENO);
    std::string program = QEL_QELCTL;
    std::string command = "decode";
    std::string option = "--batch";
    char* words[] = {program.data(), command.data(), option.data(), nullptr};
    EXPECT_EQ(::posix_spawn(&_pid, QEL_QELCTL, &actions, nullptr, words, environ), 0);
    ::posix_spawn_file_actions_destroy(&actions);
    ::close(in[0]);
    ::close(out[1]);
    _questions = in[1];
    _answers = out[0];
  }
  ~Conversation() {
    ::close(_questions);
    ::close(_answers);
    ::waitpid(_pid, nullptr, 0);
  }
  Conversation(const Conversation&) = delete;
  Conversation& operator=(const Conversation&) = delete;

  void say(std::string_view text) const {
    EXPECT_EQ(::write(_questions, text.data(), text.size()), static_cast<ssize_t>(text.size()));
  }
  // Empty when none has come for twenty seconds.
  std::string answer() const {
    pollfd there{_answers, POLLIN, 0};
    if (::poll(&there, 1, 20'000) != 1) return {};
    std::array<char, 4096> text{};
    const ssize_t count = ::read(_answers, text.data(), text.size());
    return {text.data(), static_cast<std::size_t>(std::max<ssize_t>(count, 0))};
  }

 private:
  pid_t _pid = 0;
  int _questions = -1;
  int _answers = -1;
};

TEST(QelctlDecodeBatch, answersBeforeItWaitsForTheNextLine) {
  const Conversation conversation;
  const std::string line(kLine);
  for (int i = 0; i < 3; ++i) {
    conversation.say(line + "\n");
    EXPECT_EQ(conversation.answer(), kAnswer + std::string("\n"));
  }
  conversation.say(line + "\n" + line.substr(0, 10));
  EXPECT_EQ(conversation.answer(), kAnswer + std::string("\n"));
  conversation.say(line.substr(10) + "\n");
  EXPECT_EQ(conversation.answer(), kAnswer + std::string("\n"));
}

// Longer than what is read at once, so that lines begin in one piece and end in another.
TEST(QelctlDecodeBatch, findsEachOfManyLines) {
  std::string input;
  for (int i = 0; i < 10'000; ++i) {
    input += i % 3 == 0 ? kLine : "{\"metric\": 19972, \"payload\": \"\"}";
    input += '\n';
  }
  const auto answers = linesOf(qelctl({"decode", "--batch"}, input).out);
  ASSERT_EQ(answers.size(), 10'000U);
  for (std::size_t i = 0; i < answers.size(); ++i) {
    ASSERT_EQ(answers[i], i % 3 == 0 ? kAnswer : "{}") << i;
  }
}

TEST(QelctlDecodeBatch, readsALineHoweverItIsWritten) {
  for (const char* line : {
           "{\"metric\":19972,\"payload\":\"08e8071003\"}",
           "\t{ \"metric\" : 19972 , \"payload\" : \"08E8071003\" } \r",
           "{\"payload\": \"08e8071003\", \"metric\": 19972}",
           "{\"metric\": 19972, \"payload\": \"08e8071003\", \"more\": [1, {}]}",
           "{\"metric\": 1, \"payload\": \"00\", \"payload\": \"08e8071003\", \"metric\": 19972}",
           "{\"metric\": 19972, \"payload\": \"08e807100\\u0033\"}",
       }) {
    EXPECT_EQ(qelctl({"decode", "--batch"}, line).out, kAnswer + std::string("\n")) << line;
  }
}

TEST(QelctlDecodeBatch, hasLinesOfSixteenMegabytesAtMost) {
  constexpr std::size_t kLongest = 16 * 1024 * 1024;
  std::string line = "{\"metric\": 1, \"payload\": \"\"}";
  line.insert(1, kLongest - line.size(), ' ');
  EXPECT_EQ(qelctl({"decode", "--batch"}, line + "\n" + kLine + "\n").out,
            std::string("null\n") + kAnswer + "\n");
  for (const char* end : {"", "\n"}) {
    const Outcome outcome = qelctl({"decode", "--batch"}, std::string(kLine) + "\n " + line + end);
    EXPECT_EQ(outcome.exitCode, 65);
    EXPECT_EQ(outcome.out, kAnswer + std::string("\n"));
    EXPECT_EQ(outcome.err, "qelctl: standard input, line 2: longer than 16 MB\n");
  }
}

}  // namespace
}  // namespace qel::testing

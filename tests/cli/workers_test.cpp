#include "cli/Workers.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <string>
#include <vector>

namespace cli {
namespace {

using planner::batch::Line;
using planner::batch::Status;

Line LineOf(std::int64_t number, std::string text) {
  Line line;
  line.number = number;
  line.digest = static_cast<std::uint64_t>(number) * 3;
  line.text = std::move(text);
  return line;
}

// Answers with what it got; a line "die" ends the process, "once NAME" the first one that sees it,
// which leaves a file.
Done Echo(const Line& line) {
  if (line.text == "die") kill(getpid(), SIGKILL);
  if (line.text.compare(0, 5, "once ") == 0) {
    const std::string file = line.text.substr(5);
    if (access(file.c_str(), F_OK) != 0) {
      fclose(fopen(file.c_str(), "w"));
      kill(getpid(), SIGKILL);
    }
  }
  if (line.text == "slow") usleep(50'000);
  return {line.number, Status::kOff, planner::Primitive::kTsyn,
          std::to_string(line.digest) + ":" + line.text};
}

Done Died(const Line& line) { return {line.number, Status::kFailed, {}, "died"}; }

// All answers, in the order in which they come back.
std::vector<std::string> AnswersTo(int count, const std::vector<std::string>& texts) {
  Workers workers(count, Echo, Died);
  std::vector<std::string> answers;
  std::int64_t last = 0;
  const auto take = [&] {
    while (const auto done = workers.Take()) {
      EXPECT_EQ(done->line, ++last);
      answers.push_back(done->text);
      EXPECT_EQ(done->status, done->text == "died" ? Status::kFailed : Status::kOff);
      EXPECT_EQ(done->primitive.has_value(), done->text != "died");
    }
  };
  std::int64_t number = 0;
  for (const std::string& text : texts) {
    while (workers.IsFull()) {
      workers.Wait(-1);
      take();
    }
    workers.Give(LineOf(++number, text));
  }
  while (!workers.IsIdle()) {
    workers.Wait(-1);
    take();
  }
  EXPECT_FALSE(workers.Take());
  return answers;
}

std::vector<std::string> Expected(const std::vector<std::string>& texts) {
  std::vector<std::string> answers;
  for (std::size_t i = 0; i < texts.size(); ++i) {
    answers.push_back(texts[i] == "die" ? "died" : std::to_string(3 * (i + 1)) + ":" + texts[i]);
  }
  return answers;
}

TEST(Workers, AnswerInOrder) {
  std::vector<std::string> texts;
  for (int i = 0; i < 3000; ++i) texts.push_back("line " + std::to_string(i));
  texts[5] = "slow";
  texts[6] = std::string("\0\n", 2);
  texts[7] = "";
  for (const int count : {1, 2, 5}) EXPECT_EQ(AnswersTo(count, texts), Expected(texts));
}

// More than a socket holds, both ways.
TEST(Workers, LongLines) {
  std::vector<std::string> texts;
  for (int i = 0; i < 40; ++i) texts.push_back(std::string(1'000'000, static_cast<char>('a' + i % 26)));
  EXPECT_EQ(AnswersTo(2, texts), Expected(texts));
}

TEST(Workers, NothingToDo) { EXPECT_TRUE(AnswersTo(3, {}).empty()); }

// Of all that a process has in hand when it dies only the line that it dies of is lost.
TEST(Workers, ALineThatProcessesDieOf) {
  std::vector<std::string> texts;
  for (int i = 0; i < 200; ++i) texts.push_back("line " + std::to_string(i));
  for (const int bad : {0, 50, 51, 120, 199}) texts[static_cast<std::size_t>(bad)] = "die";
  for (const int count : {1, 3}) EXPECT_EQ(AnswersTo(count, texts), Expected(texts));
}

TEST(Workers, NothingButLinesThatProcessesDieOf) {
  const std::vector<std::string> texts(10, "die");
  EXPECT_EQ(AnswersTo(2, texts), Expected(texts));
}

// A process that dies by chance: all is done again.
TEST(Workers, AProcessThatDiesOnce) {
  const std::string file = testing::TempDir() + "workers_test." + std::to_string(getpid());
  std::vector<std::string> texts;
  for (int i = 0; i < 100; ++i) texts.push_back("line " + std::to_string(i));
  texts[40] = "once " + file;
  const std::vector<std::string> answers = AnswersTo(2, texts);
  EXPECT_EQ(unlink(file.c_str()), 0);
  EXPECT_EQ(answers, Expected(texts));
}

// What comes in wakes it up, also with nothing in hand.
TEST(Workers, WaitForInput) {
  Workers workers(2, Echo, Died);
  int ends[2];
  ASSERT_EQ(pipe(ends), 0);
  workers.Give(LineOf(1, "a"));
  EXPECT_FALSE(workers.Wait(ends[0]));
  EXPECT_EQ(workers.Take()->text, "3:a");
  ASSERT_EQ(write(ends[1], "x", 1), 1);
  EXPECT_TRUE(workers.Wait(ends[0]));
  close(ends[0]);
  close(ends[1]);
}

// However slow the first line is, what is in hand is bounded.
TEST(Workers, AreFullAtSomeTime) {
  Workers workers(2, Echo, Died);
  std::int64_t number = 0;
  while (!workers.IsFull()) workers.Give(LineOf(++number, "slow"));
  EXPECT_LE(number, 64);
  workers.Wait(-1);
  EXPECT_TRUE(workers.Take());
}

}  // namespace
}  // namespace cli

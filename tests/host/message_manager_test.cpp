#include <gtest/gtest.h>
#include <sys/socket.h>
#include <unistd.h>

#include <string>

#include "host/Port_MsgManData.h"

namespace {

std::unique_ptr<Port_MsgManData> NewMessage(const char* category = "DesignEntry") {
  return Port_MsgManData::createObject(category, "test", 1, "1.0");
}

// What an issued message leaves on standard error.
template <typename... Arguments>
std::string Issued(const char* format, Arguments... arguments) {
  testing::internal::CaptureStderr();
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat-security"
  NewMessage()->issueError(format, arguments...);
#pragma GCC diagnostic pop
  return testing::internal::GetCapturedStderr();
}

TEST(MessageManager, PutsSeverityAndCategoryFirst) {
  EXPECT_EQ(Issued("Internal GetSpdKeyValue() error -- keyword is empty\n"),
            "ERROR:DesignEntry: Internal GetSpdKeyValue() error -- keyword is empty\n");
}

TEST(MessageManager, FormatsLikePrintf) {
  EXPECT_EQ(Issued("%s is %d and %3.3f, 100%%", "a%sb", 42, 2.5),
            "ERROR:DesignEntry: a%sb is 42 and 2.500, 100%\n");
}

TEST(MessageManager, EndsALineOnce) {
  EXPECT_EQ(Issued("no end"), "ERROR:DesignEntry: no end\n");
  EXPECT_EQ(Issued("one end\n"), "ERROR:DesignEntry: one end\n");
  EXPECT_EQ(Issued("%s", ""), "ERROR:DesignEntry: \n");
}

TEST(MessageManager, ShowsControlCharactersOnOneLine) {
  EXPECT_EQ(Issued("key %s\n", "a\nERROR:b\r\t\x1b[0m\x7f\\n\xc3\xbc"),
            "ERROR:DesignEntry: key a\\nERROR:b\\r\\t\\x1b[0m\\x7f\\n\xc3\xbc\n");
  EXPECT_EQ(Issued("%c|", 0), "ERROR:DesignEntry: \\x00|\n");
}

TEST(MessageManager, ShowsTheCategoryOnTheSameLine) {
  testing::internal::CaptureStderr();
  NewMessage("De\nsign")->issueError("text");
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "ERROR:De\\nsign: text\n");
}

TEST(MessageManager, TakesAnyLength) {
  const std::string text(300'000, 'x');
  EXPECT_EQ(Issued("%s!", text.c_str()), "ERROR:DesignEntry: " + text + "!\n");
}

TEST(MessageManager, FallsBackToTheFormatWhenThereIsNoText) {
  constexpr wchar_t kNoCharacter[] = {0x7fffffff, 0};
  EXPECT_EQ(Issued("%s: %ls\n", "text", kNoCharacter), "ERROR:DesignEntry: %s: %ls\n");
}

// A socket that keeps the limits of each write shows that there is one.
TEST(MessageManager, WritesAMessageInOnePiece) {
  int ends[2];
  ASSERT_EQ(socketpair(AF_UNIX, SOCK_SEQPACKET, 0, ends), 0);
  const int standard_error = dup(STDERR_FILENO);
  dup2(ends[0], STDERR_FILENO);
  NewMessage()->issueError("%s and %s\n", "this", "that");
  dup2(standard_error, STDERR_FILENO);
  close(standard_error);
  close(ends[0]);
  char buffer[200];
  const ssize_t length = recv(ends[1], buffer, sizeof buffer, 0);
  ASSERT_GT(length, 0);
  EXPECT_EQ(std::string(buffer, static_cast<std::size_t>(length)),
            "ERROR:DesignEntry: this and that\n");
  EXPECT_EQ(recv(ends[1], buffer, sizeof buffer, 0), 0);
  close(ends[1]);
}

}  // namespace

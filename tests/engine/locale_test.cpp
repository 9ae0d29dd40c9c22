// Lists and traces in a process with a decimal comma.
#include <gtest/gtest.h>

#include <clocale>
#include <cstdio>
#include <string>

#include "engine/CLocale.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/CommaLocale.h"

namespace {

using engine_test::NewImp;
using engine_test::TraceOf;

class LocaleTest : public testing::Test {
 protected:
  void SetUp() override {
    if (!CommaLocale::IsSet()) GTEST_SKIP() << "localedef can make no locale with a comma";
  }

  const CommaLocale locale_;
};

TEST_F(LocaleTest, ListsHavePoints) {
  Ip::VorkelImp& imp = NewImp();
  ASSERT_TRUE(imp.ParseOutFreqs(3, "148.5 74.25 0,5"));
  EXPECT_EQ(imp.requests.reqOutFreq[0], 148.5);
  EXPECT_EQ(imp.requests.reqOutFreq[1], 74.25);
  EXPECT_EQ(imp.requests.reqOutFreq[2], 0.0);
  ASSERT_TRUE(imp.ParsePhases(1, "22.5"));
  EXPECT_EQ(imp.requests.reqPhase[0], 22.5);
  ASSERT_TRUE(imp.ParseDutyCycles(1, "37.5"));
  EXPECT_EQ(imp.requests.reqDutyCycle[0], 37.5);
}

TEST_F(LocaleTest, TracesHavePoints) {
  const std::string text = TraceOf([](const Ip::Trace& trace) {
    TRACE(trace, "DLL %f %3.3f %d\n", 1404.75, 0.0625, 12345678);
  });
  EXPECT_EQ(text, "DLL 1404.750000 0.062 12345678\n");
}

std::string Half() {
  char text[8];
  std::snprintf(text, sizeof text, "%.1f", 0.5);
  return text;
}

// What the host has set is as it was, be it of the process or of the thread.
TEST_F(LocaleTest, TheHostKeepsItsOwn) {
  {
    const Ip::CLocale outer;
    EXPECT_EQ(Half(), "0.5");
    { const Ip::CLocale inner; }
    EXPECT_EQ(Half(), "0.5");
  }
  EXPECT_EQ(Half(), "0,5");
  EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), "comma");

  // A copy of the process's: newlocale() never frees the folders that it has looked into.
  const locale_t own = duplocale(LC_GLOBAL_LOCALE);
  ASSERT_NE(own, nullptr);
  std::setlocale(LC_ALL, "C");
  const locale_t before = uselocale(own);
  { const Ip::CLocale c; }
  EXPECT_EQ(Half(), "0,5");
  EXPECT_EQ(uselocale(before), own);
  freelocale(own);
}

}  // namespace

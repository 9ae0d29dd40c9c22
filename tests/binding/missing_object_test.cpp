// What every method checks before it does anything: its number of words, then its object.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <string>

#include "binding/VorkelPtrHandle.h"
#include "tests/binding/MethodFacts.h"

namespace {

class EveryMethod : public testing::TestWithParam<MethodFacts> {
 protected:
  // The status of a call with `arguments` words; notes how many of them were read.
  int Call(Ip::VorkelPtrHandle& handle, int arguments) {
    interp_.SetResult("before");
    const TestWords words(handle, NameAndArguments(GetParam().name, arguments));
    const int status = handle.Execute(words.Count(), words.Data(), interp_.get());
    reads_ = words.ArgumentReads();
    return status;
  }

  BoundInterp interp_;
  Ip::VorkelPtrHandle empty_{interp_.get()};
  int reads_ = 0;
};

TEST_P(EveryMethod, WithoutObjectSaysSoAndReadsNothing) {
  const MethodFacts& method = GetParam();
  const int status = Call(empty_, method.arguments);
  EXPECT_EQ(reads_, 0);
  if (method.missingObject == nullptr) {
    EXPECT_EQ(status, TCL_OK);
    EXPECT_EQ(interp_.Result(), "before");
  } else {
    EXPECT_EQ(status, TCL_ERROR);
    EXPECT_EQ(interp_.Result(), method.missingObject);
  }
}

TEST_P(EveryMethod, CountsItsWordsFirst) {
  const MethodFacts& method = GetParam();
  for (const int arguments : {method.arguments - 1, method.arguments + 1, method.arguments + 40}) {
    if (arguments < 0) continue;
    EXPECT_EQ(Call(empty_, arguments), TCL_ERROR) << arguments;
    EXPECT_EQ(interp_.Result(), WrongCount(method)) << arguments;
    EXPECT_EQ(reads_, 0) << arguments;
  }
}

TEST_P(EveryMethod, CountsItsWordsWithAnObjectToo) {
  const MethodFacts& method = GetParam();
  Ip::VorkelImp imp(interp_.get());
  Ip::VorkelPtrHandle handle(&imp, interp_.get());
  for (const int arguments : {method.arguments - 1, method.arguments + 1}) {
    if (arguments < 0) continue;
    EXPECT_EQ(Call(handle, arguments), TCL_ERROR) << arguments;
    EXPECT_EQ(interp_.Result(), WrongCount(method)) << arguments;
    EXPECT_EQ(reads_, 0) << arguments;
  }
}

TEST_P(EveryMethod, WithTheRightCountAndAnObjectHasOtherAnswers) {
  const MethodFacts& method = GetParam();
  Ip::VorkelImp imp(interp_.get());
  Ip::VorkelPtrHandle handle(&imp, interp_.get());
  const int status = Call(handle, method.arguments);
  EXPECT_TRUE(status == TCL_OK || status == TCL_ERROR) << status;
  EXPECT_NE(interp_.Result(), WrongCount(method));
  if (method.missingObject != nullptr) {
    EXPECT_NE(interp_.Result(), method.missingObject);
  }
}

// A word without effect is read like the others; only SetVcoMinThreshold leaves its word alone.
TEST_P(EveryMethod, ReadsEachOfItsWordsOnce) {
  const MethodFacts& method = GetParam();
  Ip::VorkelImp imp(interp_.get());
  Ip::VorkelPtrHandle handle(&imp, interp_.get());
  Call(handle, method.arguments);
  EXPECT_EQ(reads_, method.missingObject == nullptr ? 0 : method.arguments);
}

INSTANTIATE_TEST_SUITE_P(Methods, EveryMethod, testing::ValuesIn(kMethodFacts),
                         [](const auto& method) { return std::string(method.param.name); });

TEST(SetVcoMinThreshold, ChangesNothingAndReadsNothing) {
  BoundInterp interp;
  Ip::VorkelImp imp(interp.get());
  Ip::VorkelPtrHandle handle(&imp, interp.get());
  const TestWords words(handle, {"SetVcoMinThreshold", "123"});
  interp.SetResult("before");
  EXPECT_EQ(handle.Execute(words.Count(), words.Data(), interp.get()), TCL_OK);
  EXPECT_EQ(interp.Result(), "before");
  EXPECT_EQ(words.ArgumentReads(), 0);
  EXPECT_EQ(imp.pllLimits.vcoMin, 400.0);
  EXPECT_EQ(imp.pll.minAdjVco, 400.0);
}

}  // namespace

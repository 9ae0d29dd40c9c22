// The creation command with a host of script handles that refuses.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <new>
#include <stdexcept>
#include <string>

#include "binding/VorkelPtrHandle.h"
#include "tests/binding/FakeHandles.h"
#include "tests/binding/FakeStubs.h"
#include "tests/support/RefusingAllocator.h"

// Defined in binding/PackageEntry.cpp.
extern "C" int InitVorkel(ClientData data, Tcl_Interp* interp, int objc, Tcl_Obj* const* objv);

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

class CreationTest : public testing::Test {
 protected:
  CreationTest() {
    stubs_ = FakeStubs{};
    handles_ = FakeHandles{};
  }
  ~CreationTest() override { handles_ = FakeHandles{}; }

  static int Init() { return InitVorkel(nullptr, FakeStubs::Interp(), 1, nullptr); }

  // Runs the command; the object that it has made is there still.
  int InitAndKeep() {
    const CountFrees frees(sizeof(Ip::VorkelImp));
    const int status = Init();
    EXPECT_EQ(frees.Count(), 0);
    EXPECT_NE(handles_.value, nullptr);
    return status;
  }

  FakeStubs& stubs_ = FakeStubs::Instance();
  FakeHandles& handles_ = FakeHandles::Instance();
};

TEST_F(CreationTest, MakesAHandleAndMakesItTheResult) {
  EXPECT_EQ(InitAndKeep(), TCL_OK);
  EXPECT_THAT(handles_.calls, ElementsAre("make", "result"));
  EXPECT_EQ(static_cast<Ip::VorkelImp*>(handles_.value)->interp, FakeStubs::Interp());
  EXPECT_THAT(stubs_.calls, IsEmpty());
}

TEST_F(CreationTest, SucceedsWhateverTheHostAnswersToTheResult) {
  for (const int status : {TCL_ERROR, TCL_RETURN, -1, 17}) {
    handles_ = FakeHandles{};
    handles_.setResultStatus = status;
    EXPECT_EQ(InitAndKeep(), TCL_OK) << status;
    EXPECT_THAT(handles_.calls, ElementsAre("make", "result")) << status;
    EXPECT_THAT(stubs_.calls, IsEmpty()) << status;
  }
}

// Tcl is C: an exception would go through it.
TEST_F(CreationTest, SucceedsWhateverTheHostThrowsAtTheResult) {
  handles_.whileMadeTheResult = [] { throw std::bad_alloc(); };
  EXPECT_EQ(InitAndKeep(), TCL_OK);
  handles_.whileMadeTheResult = [] { throw std::runtime_error("no result"); };
  EXPECT_EQ(InitAndKeep(), TCL_OK);
  EXPECT_THAT(handles_.calls, Not(Contains("destroy")));
  EXPECT_THAT(stubs_.calls, IsEmpty());
}

TEST_F(CreationTest, FailsWithoutAHandleAndKeepsTheObject) {
  handles_.whileMade = [] { throw std::bad_alloc(); };
  EXPECT_EQ(InitAndKeep(), TCL_ERROR);
  EXPECT_THAT(handles_.calls, ElementsAre("make"));
  EXPECT_THAT(stubs_.calls, ElementsAre("result interp volatile"));
  EXPECT_EQ(stubs_.result, "Ip::Vorkel::Init: out of memory.");
}

TEST_F(CreationTest, WithoutMemoryForTheHandleKeepsTheObject) {
  const CountFrees frees(sizeof(Ip::VorkelImp));
  const RefuseSize refuse(sizeof(Ip::VorkelPtrHandle));
  EXPECT_EQ(Init(), TCL_ERROR);
  EXPECT_EQ(Refusals(), 1);
  EXPECT_EQ(frees.Count(), 0);
  EXPECT_THAT(handles_.calls, IsEmpty());
  EXPECT_EQ(stubs_.result, "Ip::Vorkel::Init: out of memory.");
}

TEST_F(CreationTest, WithoutMemoryForTheObjectMakesAHandleWithoutOne) {
  const RefuseSize refuse(sizeof(Ip::VorkelImp));
  EXPECT_EQ(Init(), TCL_OK);
  EXPECT_EQ(Refusals(), 1);
  EXPECT_THAT(handles_.calls, ElementsAre("make", "result"));
  EXPECT_EQ(handles_.value, nullptr);
  EXPECT_THAT(stubs_.calls, IsEmpty());
}

// What the tests above count on.
TEST(CountFreesTest, CountsAnObjectThatIsDeleted) {
  const CountFrees frees(sizeof(Ip::VorkelImp));
  delete new Ip::VorkelImp(nullptr);
  EXPECT_EQ(frees.Count(), 1);
}

}  // namespace

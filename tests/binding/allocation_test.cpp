// The creation command and the handle class when memory runs out.
//
// This program has an allocator of its own, which can be told to refuse memory.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <exception>
#include <memory>
#include <string>

#include "binding/VorkelPtrHandle.h"
#include "tests/binding/MethodFacts.h"
#include "tests/support/RefusingAllocator.h"

// Defined in binding/PackageEntry.cpp.
extern "C" int InitVorkel(ClientData data, Tcl_Interp* interp, int objc, Tcl_Obj* const* objv);

// Implementation objects live until the process ends; the leak checker need not tell.
extern "C" const char* __asan_default_options() { return "detect_leaks=0"; }

namespace {

using TypedHandle = Script::PtrHandle<Ip::VorkelImp>;

class Creation : public testing::Test {
 protected:
  Creation() {
    Tcl_CreateObjCommand(interp_.get(), "Ip::Vorkel::Init", InitVorkel, nullptr, nullptr);
  }

  TestInterp interp_;
};

TEST_F(Creation, WithMemoryGivesAHandleWithAnObject) {
  ASSERT_EQ(interp_.Eval("set h [Ip::Vorkel::Init]"), TCL_OK) << interp_.Result();
  EXPECT_EQ(interp_.Eval("$h GetChosenM"), TCL_OK);
  EXPECT_EQ(interp_.Result(), "0.000");
}

TEST_F(Creation, WithoutMemoryForTheObjectGivesAHandleWithoutOne) {
  {
    const RefuseSize refuse(sizeof(Ip::VorkelImp));
    ASSERT_EQ(interp_.Eval("set h [Ip::Vorkel::Init]"), TCL_OK) << interp_.Result();
    ASSERT_EQ(Refusals(), 1);
  }
  for (const MethodFacts& method : kMethodFacts) {
    const std::string call = std::string("$h ") + method.name + " {*}[lrepeat " +
                             std::to_string(method.arguments) + " 1]";
    const int status = interp_.Eval(call);
    if (method.missingObject == nullptr) {
      EXPECT_EQ(status, TCL_OK);
      EXPECT_EQ(interp_.Result(), "");
    } else {
      EXPECT_EQ(status, TCL_ERROR) << call;
      EXPECT_EQ(interp_.Result(), method.missingObject);
    }
  }
}

TEST_F(Creation, WithoutMemoryForTheHandleFails) {
  interp_.SetResult("before");
  {
    const RefuseSize refuse(sizeof(Ip::VorkelPtrHandle));
    ASSERT_EQ(interp_.Eval("Ip::Vorkel::Init a b"), TCL_ERROR);
    ASSERT_GE(Refusals(), 1);
  }
  EXPECT_EQ(interp_.Result(), "Ip::Vorkel::Init: out of memory.");
  EXPECT_EQ(interp_.Eval("[Ip::Vorkel::Init] GetChosenM"), TCL_OK);
  EXPECT_EQ(interp_.Result(), "0.000");
}

// Whatever is refused on the way, nothing is thrown at Tcl, which is C. Of all that is made, only
// the handle is missed with an error. Each time in an interpreter of its own, since the first handle
// of one makes what all its handles share; and there the next handle has all.
TEST_F(Creation, FailsForWantOfTheHandleOnlyAndThrowsNothing) {
  int refused = 1;
  int failed = 0;
  for (int allocations = 0; refused > 0; ++allocations) {
    ASSERT_LT(allocations, 1000);
    TestInterp interp;
    int status = TCL_ERROR;
    std::string thrown;
    {
      const RefuseAfter refuse(allocations);
      try {
        status = InitVorkel(nullptr, interp.get(), 0, nullptr);
      } catch (const std::exception& error) {
        thrown = error.what();
      }
      refused = Refusals();
    }
    EXPECT_EQ(thrown, "") << "after " << allocations << " allocations";
    if (!thrown.empty()) continue;
    const bool saysSo = interp.Result() == "Ip::Vorkel::Init: out of memory.";
    EXPECT_EQ(saysSo, status == TCL_ERROR) << "after " << allocations << " allocations";
    if (status == TCL_ERROR) ++failed;
    ASSERT_EQ(InitVorkel(nullptr, interp.get(), 0, nullptr), TCL_OK);
    EXPECT_EQ(interp.Eval(interp.Result() + " GetChosenM"), TCL_OK) << interp.Result();
    EXPECT_EQ(interp.Result(), "0.000") << "after " << allocations << " allocations";
  }
  EXPECT_EQ(failed, 1);
}

TEST_F(Creation, IgnoresItsClientDataAndAllItsWords) {
  int data = 0;
  EXPECT_EQ(InitVorkel(&data, interp_.get(), 0, nullptr), TCL_OK);
  const std::string first = interp_.Result();
  EXPECT_EQ(InitVorkel(nullptr, interp_.get(), 5, nullptr), TCL_OK);
  const std::string second = interp_.Result();
  EXPECT_NE(first, second);
  EXPECT_EQ(interp_.Eval(first + " GetChosenD"), TCL_OK);
  EXPECT_EQ(interp_.Result(), "0");
  EXPECT_EQ(interp_.Eval(second + " GetChosenD"), TCL_OK);
  EXPECT_EQ(interp_.Result(), "0");
}

TEST_F(Creation, OfManyHandlesGivesDifferentOnes) {
  ASSERT_EQ(interp_.Eval("for {set i 0} {$i < 200} {incr i} {dict set all [Ip::Vorkel::Init] 1}\n"
                         "dict size $all"),
            TCL_OK);
  EXPECT_EQ(interp_.Result(), "200");
}

TEST(HandleAllocation, CreateHandleWithoutMemoryIsNull) {
  TestInterp interp;
  const Ip::VorkelPtrHandle handle(interp.get());
  const TypedHandle typed(interp.get());
  {
    const RefuseSize refuse(sizeof(Ip::VorkelPtrHandle));
    EXPECT_EQ(handle.CreateHandle(interp.get()), nullptr);
    EXPECT_EQ(typed.CreateHandle(interp.get()), nullptr);
    EXPECT_EQ(Refusals(), 2);
  }
  EXPECT_NE(std::unique_ptr<Script::Handle>(handle.CreateHandle(interp.get())), nullptr);
}

// The prototype of a class, which no other test of this program has made.
template <typename Handle>
void ExpectPrototypeIsTriedForAgain() {
  TestInterp interp;
  // The prototype lives until the process ends, and its interpreter with it.
  static Tcl_Interp* const lasting = Tcl_CreateInterp();
  const Handle refused(interp.get());
  {
    const RefuseSize refuse(sizeof(Handle));
    EXPECT_EQ(refused.GetPtrHandleBase(), nullptr);
    EXPECT_EQ(refused.GetPtrHandleBase(), nullptr);
    EXPECT_EQ(Refusals(), 2);
  }
  const Handle served(lasting);
  Script::PtrHandleBase* const prototype = served.GetPtrHandleBase();
  ASSERT_NE(prototype, nullptr);
  EXPECT_EQ(prototype->GetTclInterp(), lasting);
  {
    const RefuseSize refuse(sizeof(Handle));
    EXPECT_EQ(refused.GetPtrHandleBase(), prototype);
    EXPECT_EQ(Refusals(), 0);
  }
}

TEST(HandleAllocation, ThePrototypeIsTriedForAgain) {
  ExpectPrototypeIsTriedForAgain<Ip::VorkelPtrHandle>();
}

TEST(HandleAllocation, TheTypedPrototypeIsTriedForAgain) {
  ExpectPrototypeIsTriedForAgain<TypedHandle>();
}

}  // namespace

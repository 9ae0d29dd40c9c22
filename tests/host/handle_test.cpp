// Handles and their commands: names, and which ends when.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <memory>
#include <string>

#include "tests/host/script_fixture.h"

namespace {

using testing::MatchesRegex;
using testing::StartsWith;

TEST(HandleName, IsUniqueAndFullyQualified) {
  const Interpreter tcl;
  HandleLog log;
  auto* const first = new LoggedHandle(&log, tcl.get());
  auto* const second = new LoggedHandle(&log, tcl.get());
  EXPECT_THAT(first->GetString(), MatchesRegex("::Script::handle[1-9][0-9]*"));
  EXPECT_THAT(second->GetString(), MatchesRegex("::Script::handle[1-9][0-9]*"));
  EXPECT_STRNE(first->GetString(), second->GetString());
  EXPECT_STREQ(first->GetString(), first->GetString());
  EXPECT_EQ(first->GetTclObj(), first->GetTclObj());
  EXPECT_STREQ(Tcl_GetString(first->GetTclObj()), first->GetString());
}

TEST(HandleName, IsNeverUsedAgain) {
  const Interpreter tcl;
  HandleLog log;
  auto* handle = new LoggedHandle(&log, tcl.get());
  const std::string name = handle->GetString();
  delete handle;
  handle = new LoggedHandle(&log, tcl.get());
  EXPECT_NE(handle->GetString(), name);
  const Interpreter other;
  EXPECT_NE((new LoggedHandle(&log, other.get()))->GetString(), name);
}

TEST(HandleName, PassesOverCommandsOfTheScript) {
  const Interpreter tcl;
  HandleLog log;
  const std::string before = (new LoggedHandle(&log, tcl.get()))->GetString();
  const int number = std::stoi(before.substr(std::string("::Script::handle").size()));
  const std::string taken = "::Script::handle" + std::to_string(number + 1);
  tcl.Eval("proc " + taken + " {} {return mine}");
  auto* const handle = new LoggedHandle(&log, tcl.get());
  EXPECT_EQ(handle->GetString(), "::Script::handle" + std::to_string(number + 2));
  EXPECT_EQ(tcl.Eval(taken), "mine");
}

TEST(HandleName, FollowsRename) {
  const Interpreter tcl;
  HandleLog log;
  auto* const handle = new LoggedHandle(&log, tcl.get());
  const std::string name = handle->GetString();
  Tcl_Obj* const kept = handle->GetTclObj();
  Tcl_IncrRefCount(kept);
  EXPECT_EQ(tcl.Eval("rename " + name + " k"), "");
  EXPECT_STREQ(handle->GetString(), "::k");
  EXPECT_EQ(kept->refCount, 1);  // nobody else has it any more
  tcl.Eval("namespace eval a::b {}; rename k a::b::k2");
  EXPECT_STREQ(handle->GetString(), "::a::b::k2");
  // What a script has kept does not change under it.
  EXPECT_EQ(Tcl_GetString(kept), name);
  Tcl_DecrRefCount(kept);
  EXPECT_EQ(tcl.Eval("::a::b::k2 x"), "");
  EXPECT_EQ(log.executed, 1);
  EXPECT_EQ(log.deleted, 0);
}

TEST(HandleCommand, IsMadeWhenAskedFor) {
  const Interpreter tcl;
  HandleLog log;
  auto* const handle = new LoggedHandle(&log, tcl.get());
  EXPECT_EQ(tcl.Eval("info commands ::Script::*"), "");
  EXPECT_EQ(log.attached, 0);
  handle->GetTclObj();
  EXPECT_EQ(log.attached, 1);
  handle->GetString();
  EXPECT_EQ(log.attached, 1);
  EXPECT_EQ(tcl.Eval("llength [info commands ::Script::*]"), "1");
}

TEST(HandleCommand, OwnsTheHandle) {
  const Interpreter tcl;
  HandleLog log;
  auto* const handle = new LoggedHandle(&log, tcl.get());
  const std::string name = handle->GetString();
  EXPECT_EQ(tcl.Eval("rename " + name + " {}"), "");
  EXPECT_EQ(log.detached, 1);
  EXPECT_EQ(log.deleted, 1);
  EXPECT_THAT(tcl.Eval(name), StartsWith("error: invalid command name"));
}

TEST(HandleCommand, DeletesTheHandleWhenItIsReplaced) {
  const Interpreter tcl;
  HandleLog log;
  auto* const handle = new LoggedHandle(&log, tcl.get());
  const std::string name = handle->GetString();
  tcl.Eval("proc " + name + " {} {return new}");
  EXPECT_EQ(log.deleted, 1);
  EXPECT_EQ(tcl.Eval(name), "new");
}

TEST(HandleCommand, EndsWithItsNamespace) {
  const Interpreter tcl;
  HandleLog log;
  for (int i = 0; i < 3; ++i) (new LoggedHandle(&log, tcl.get()))->GetTclObj();
  EXPECT_EQ(tcl.Eval("namespace delete ::Script"), "");
  EXPECT_EQ(log.detached, 3);
  EXPECT_EQ(log.deleted, 3);
  // The next handle makes the namespace again.
  EXPECT_THAT((new LoggedHandle(&log, tcl.get()))->GetString(), StartsWith("::Script::handle"));
}

TEST(HandleCommand, EndsWithItsInterpreter) {
  Interpreter tcl;
  HandleLog log;
  for (int i = 0; i < 3; ++i) (new LoggedHandle(&log, tcl.get()))->GetTclObj();
  tcl.End();
  EXPECT_EQ(log.detached, 3);
  EXPECT_EQ(log.deleted, 3);
}

TEST(HandleCommand, EndsWithTheHandle) {
  const Interpreter tcl;
  HandleLog log;
  auto* const handle = new LoggedHandle(&log, tcl.get());
  const std::string name = handle->GetString();
  tcl.Eval("set deletions 0; trace add command " + name + " delete {incr deletions ;#}");
  delete handle;
  EXPECT_EQ(log.deleted, 1);
  EXPECT_EQ(tcl.Eval("set deletions"), "1");
  EXPECT_EQ(tcl.Eval("info commands ::Script::*"), "");
}

TEST(HandleCommand, EndsWithTheHandleUnderItsNewName) {
  const Interpreter tcl;
  HandleLog log;
  auto* const handle = new LoggedHandle(&log, tcl.get());
  tcl.Eval("rename " + std::string(handle->GetString()) + " k");
  delete handle;
  EXPECT_EQ(log.deleted, 1);
  EXPECT_EQ(tcl.Eval("info commands k"), "");
}

TEST(HandleCommand, IsOneInEachInterpreter) {
  Interpreter one;
  const Interpreter two;
  HandleLog log_one;
  HandleLog log_two;
  const std::string name_one = (new LoggedHandle(&log_one, one.get()))->GetString();
  const std::string name_two = (new LoggedHandle(&log_two, two.get()))->GetString();
  EXPECT_NE(name_one, name_two);
  EXPECT_EQ(one.Eval(name_one), "");
  EXPECT_THAT(one.Eval(name_two), StartsWith("error: invalid command name"));
  one.End();
  EXPECT_EQ(log_one.deleted, 1);
  EXPECT_EQ(log_two.deleted, 0);
  EXPECT_EQ(two.Eval(name_two), "");
  EXPECT_EQ(log_two.executed, 1);
}

TEST(HandleValue, IsStoredOrRefused) {
  const Interpreter tcl;
  int object = 0;
  class Valued : public Script::PtrHandleBase {
   public:
    using PtrHandleBase::PtrHandleBase;
    Handle* CreateHandle(Tcl_Interp*) const override { return nullptr; }
    PtrHandleBase* GetPtrHandleBase() const override { return nullptr; }
  };
  void* value = &value;
  EXPECT_EQ(Valued(&object, tcl.get()).GetValue(&value), TCL_OK);
  EXPECT_EQ(value, &object);
  value = &value;
  EXPECT_NE(Valued(tcl.get()).GetValue(&value), TCL_OK);
  EXPECT_NE(Valued(nullptr, tcl.get()).GetValue(&value), TCL_OK);
  EXPECT_EQ(value, &value);
}

TEST(HandleResult, BecomesTheResultAndTheVariable) {
  const Interpreter tcl;
  HandleLog log;
  auto* const handle = new LoggedHandle(&log, tcl.get());
  ASSERT_EQ(handle->SetResult(tcl.get()), TCL_OK);
  EXPECT_EQ(tcl.Result(), handle->GetString());
  ASSERT_EQ(handle->SetVariable(tcl.get(), "h"), TCL_OK);
  EXPECT_EQ(tcl.Eval("set h"), handle->GetString());
  EXPECT_EQ(tcl.Eval("$h word"), "");
  EXPECT_EQ(log.executed, 1);
  tcl.Eval("array set a {}");
  EXPECT_EQ(handle->SetVariable(tcl.get(), "a"), TCL_ERROR);
  EXPECT_THAT(tcl.Result(), StartsWith("can't set \"a\""));
  EXPECT_EQ(handle->SetVariable(tcl.get(), nullptr), TCL_ERROR);
  EXPECT_EQ(handle->SetResult(nullptr), TCL_ERROR);
  EXPECT_EQ(handle->SetVariable(nullptr, "h"), TCL_ERROR);
}

TEST(HandleResult, IsUntouchedByTheMakingOfAHandle) {
  const Interpreter tcl;
  ASSERT_EQ(Ptrhandleqrm_Init(tcl.get()), TCL_OK);
  HandleLog log;
  Tcl_SetObjResult(tcl.get(), Tcl_NewStringObj("before", -1));
  (new LoggedHandle(&log, tcl.get()))->GetTclObj();
  EXPECT_EQ(tcl.Result(), "before");
}

void ExpectNotVisible(Script::PtrHandleBase* handle, Tcl_Interp* interp) {
  EXPECT_EQ(handle->GetTclObj(), nullptr);
  EXPECT_EQ(handle->GetString(), nullptr);
  EXPECT_EQ(handle->SetResult(interp), TCL_ERROR);
  EXPECT_EQ(handle->SetVariable(interp, "v"), TCL_ERROR);
}

TEST(HandleWithoutInterpreter, IsNeverVisible) {
  HandleLog log;
  LoggedHandle handle(&log, nullptr);
  ExpectNotVisible(&handle, nullptr);
  EXPECT_EQ(handle.GetTclInterp(), nullptr);
  const Interpreter tcl;
  ExpectNotVisible(&handle, tcl.get());
  EXPECT_EQ(log.attached, 0);
}

// Tcl's own check: an interpreter without a stubs table. In a process of its own, because Tcl
// is reached once for the whole process.
TEST(HandleWithoutTclDeathTest, IsNeverVisible) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  const auto try_handle = [] {
    alignas(std::max_align_t) std::array<char, 4096> no_stubs{};
    auto* const interp = reinterpret_cast<Tcl_Interp*>(no_stubs.data());
    HandleLog log;
    LoggedHandle handle(&log, interp);
    const bool refused = handle.GetTclObj() == nullptr && handle.GetString() == nullptr &&
                         handle.SetResult(interp) == TCL_ERROR &&
                         handle.SetVariable(interp, "v") == TCL_ERROR &&
                         Ptrhandleqrm_Init(interp) == TCL_ERROR && log.attached == 0;
    std::exit(refused ? 0 : 1);
  };
  EXPECT_EXIT(try_handle(), testing::ExitedWithCode(0), "");
}

TEST(HandleThatOutlivesItsInterpreter, ForgetsIt) {
  Interpreter tcl;
  HandleLog log;
  auto handle = std::make_unique<LoggedHandle>(&log, tcl.get());
  EXPECT_EQ(handle->GetTclInterp(), tcl.get());
  tcl.End();
  EXPECT_EQ(log.deleted, 0);
  EXPECT_EQ(handle->GetTclInterp(), nullptr);
  const Interpreter other;
  ExpectNotVisible(handle.get(), other.get());
  handle.reset();
  EXPECT_EQ(log.deleted, 1);
}

TEST(HandleOfADyingInterpreter, IsNotVisible) {
  Interpreter tcl;
  HandleLog early_log;
  HandleLog late_log;
  auto early = std::make_unique<LoggedHandle>(&early_log, tcl.get());
  Tcl_Interp* const interp = tcl.get();
  Tcl_Preserve(interp);
  tcl.End();
  auto late = std::make_unique<LoggedHandle>(&late_log, interp);
  EXPECT_EQ(early->GetTclInterp(), interp);
  EXPECT_EQ(late->GetTclInterp(), nullptr);
  EXPECT_EQ(early->GetTclObj(), nullptr);
  EXPECT_EQ(late->GetTclObj(), nullptr);
  Tcl_Release(interp);
  EXPECT_EQ(early->GetTclObj(), nullptr);
  EXPECT_EQ(late->GetTclObj(), nullptr);
}

TEST(TypedHandle, SharesAPrototypeAndCreatesItsKind) {
  struct Native {};
  const Interpreter tcl;
  Native native;
  const Script::PtrHandle<Native> first(&native, tcl.get());
  const Script::PtrHandle<Native> second(tcl.get());
  Script::PtrHandleBase* const prototype = first.GetPtrHandleBase();
  ASSERT_NE(prototype, nullptr);
  EXPECT_EQ(second.GetPtrHandleBase(), prototype);
  void* value = nullptr;
  EXPECT_NE(prototype->GetValue(&value), TCL_OK);
  const std::unique_ptr<Script::Handle> created(first.CreateHandle(tcl.get()));
  const auto* const typed = dynamic_cast<Script::PtrHandle<Native>*>(created.get());
  ASSERT_NE(typed, nullptr);
  EXPECT_NE(typed->GetValue(&value), TCL_OK);
  EXPECT_EQ(typed->GetTclInterp(), tcl.get());
}

}  // namespace

// Calls of a handle by scripts.
#include <gtest/gtest.h>
#include <unistd.h>

#include <new>
#include <stdexcept>
#include <string>
#include <vector>

#include "tests/host/script_fixture.h"

namespace {

using Words = const Script::Handle* const*;

// A handle in an interpreter, called by the name `h`.
class HandleCallTest : public testing::Test {
 protected:
  void MakeHandle(LoggedHandle::Body body) {
    handle_ = new LoggedHandle(&log_, tcl_.get(), std::move(body));
    handle_->SetVariable(tcl_.get(), "h");
  }

  Interpreter tcl_;
  HandleLog log_;
  LoggedHandle* handle_ = nullptr;
};

TEST_F(HandleCallTest, PassesTheHandleAndTheWords) {
  std::vector<std::string> seen;
  MakeHandle([&](int objc, Words objv, Tcl_Interp* interp) {
    EXPECT_EQ(interp, tcl_.get());
    EXPECT_EQ(objv[0], handle_);
    for (int i = 1; i < objc; ++i) {
      seen.emplace_back(objv[i]->GetString());
      EXPECT_STREQ(Tcl_GetString(objv[i]->GetTclObj()), objv[i]->GetString());
    }
    return TCL_OK;
  });
  EXPECT_EQ(tcl_.Eval("$h Method {a b} {} x"), "");
  EXPECT_EQ(seen, (std::vector<std::string>{"Method", "a b", "", "x"}));
  seen.clear();
  EXPECT_EQ(tcl_.Eval("$h"), "");
  EXPECT_EQ(seen, std::vector<std::string>());
  EXPECT_EQ(log_.executed, 2);
}

TEST_F(HandleCallTest, TakesAnyNumberOfWords) {
  MakeHandle([&](int objc, Words objv, Tcl_Interp* interp) {
    std::string joined;
    for (int i = 1; i < objc; ++i) joined += std::string(objv[i]->GetString()) + ' ';
    Tcl_SetObjResult(interp, Tcl_NewStringObj(joined.c_str(), -1));
    EXPECT_EQ(objv[0], handle_);
    return TCL_OK;
  });
  std::string words;
  for (int count = 0; count <= 40; ++count) {
    EXPECT_EQ(tcl_.Eval("$h " + words), words);
    words += "word" + std::to_string(count) + ' ';
  }
  for (int i = 0; i < 5000; ++i) words += "w ";
  EXPECT_EQ(tcl_.Eval("$h " + words), words);
}

TEST_F(HandleCallTest, GivesStatusAndResultBack) {
  int status = TCL_OK;
  MakeHandle([&](int, Words, Tcl_Interp* interp) {
    Tcl_SetObjResult(interp, Tcl_NewStringObj("answer", -1));
    return status;
  });
  EXPECT_EQ(tcl_.Eval("$h x"), "answer");
  status = TCL_ERROR;
  EXPECT_EQ(tcl_.Eval("$h x"), "error: answer");
  status = TCL_BREAK;
  EXPECT_EQ(tcl_.Eval("set n 0; while 1 {incr n; $h x}; set n"), "1");
}

TEST_F(HandleCallTest, OffersWordsThatAreHandlesOfTheirOwn) {
  MakeHandle([](int, Words objv, Tcl_Interp* interp) {
    auto* const word = const_cast<Script::Handle*>(objv[1]);
    EXPECT_EQ(word->CreateHandle(interp), nullptr);
    EXPECT_EQ(word->GetPtrHandleBase(), nullptr);
    EXPECT_EQ(word->SetVariable(interp, "v"), TCL_OK);
    EXPECT_EQ(word->SetVariable(interp, "array"), TCL_ERROR);
    EXPECT_EQ(word->SetVariable(nullptr, "v"), TCL_ERROR);
    EXPECT_EQ(word->SetResult(nullptr), TCL_ERROR);
    return word->SetResult(interp);
  });
  tcl_.Eval("array set array {}");
  EXPECT_EQ(tcl_.Eval("$h {a word}"), "a word");
  EXPECT_EQ(tcl_.Eval("set v"), "a word");
}

TEST_F(HandleCallTest, RefusesMethodsWordsDoNotHave) {
  MakeHandle([](int objc, Words objv, Tcl_Interp* interp) {
    return const_cast<Script::Handle*>(objv[1])->Execute(objc, objv, interp);
  });
  EXPECT_EQ(tcl_.Eval("$h x"), "error: this handle has no methods");
}

TEST(HandleDefault, HasNoMethods) {
  struct Native {};
  const Interpreter tcl;
  auto* const handle = new Script::PtrHandle<Native>(tcl.get());
  EXPECT_EQ(tcl.Eval(std::string(handle->GetString()) + " Method"),
            "error: this handle has no methods");
  EXPECT_EQ(handle->Execute(0, nullptr, nullptr), TCL_ERROR);
}

TEST_F(HandleCallTest, TurnsExceptionsIntoErrors) {
  MakeHandle([](int, Words objv, Tcl_Interp*) -> int {
    const std::string kind = objv[1]->GetString();
    if (kind == "memory") throw std::bad_alloc();
    if (kind == "runtime") throw std::runtime_error("the reason");
    throw 42;
  });
  EXPECT_EQ(tcl_.Eval("$h memory"), "error: out of memory");
  EXPECT_EQ(tcl_.Eval("$h runtime"), "error: the reason");
  EXPECT_EQ(tcl_.Eval("$h else"), "error: unknown error");
  EXPECT_EQ(tcl_.Eval("catch {$h runtime} text; set text"), "the reason");
}

TEST_F(HandleCallTest, SurvivesTheEndOfItsCommand) {
  MakeHandle([&](int, Words objv, Tcl_Interp* interp) {
    const std::string name = objv[0]->GetString();
    EXPECT_EQ(Tcl_Eval(interp, "rename $h {}"), TCL_OK);
    EXPECT_EQ(log_.detached, 1);
    EXPECT_EQ(log_.deleted, 0);
    // Its name is what it was, and it does not become a command again.
    EXPECT_EQ(objv[0]->GetString(), name);
    EXPECT_EQ(Tcl_Eval(interp, "info commands ::Script::*"), TCL_OK);
    EXPECT_STREQ(Tcl_GetStringResult(interp), "");
    return TCL_OK;
  });
  EXPECT_EQ(tcl_.Eval("$h x"), "");
  EXPECT_EQ(log_.deleted, 1);
  EXPECT_EQ(log_.detached, 1);
}

TEST_F(HandleCallTest, SurvivesTheEndOfItsCommandInANestedCall) {
  MakeHandle([&](int, Words objv, Tcl_Interp* interp) {
    const std::string what = objv[1]->GetString();
    EXPECT_EQ(Tcl_Eval(interp, what == "outer" ? "$h inner" : "rename $h {}"), TCL_OK);
    EXPECT_EQ(log_.deleted, 0);
    return TCL_OK;
  });
  EXPECT_EQ(tcl_.Eval("$h outer"), "");
  EXPECT_EQ(log_.executed, 2);
  EXPECT_EQ(log_.deleted, 1);
}

TEST_F(HandleCallTest, CanDeleteItself) {
  MakeHandle([&](int, Words, Tcl_Interp*) {
    HandleLog& log = log_;
    delete handle_;  // and with it this function
    EXPECT_EQ(log.deleted, 1);
    return TCL_OK;
  });
  EXPECT_EQ(tcl_.Eval("$h x"), "");
  EXPECT_EQ(log_.deleted, 1);
  EXPECT_EQ(tcl_.Eval("info commands ::Script::*"), "");
}

TEST_F(HandleCallTest, CanEndAnotherHandle) {
  HandleLog other_log;
  auto* const other = new LoggedHandle(&other_log, tcl_.get());
  other->SetVariable(tcl_.get(), "other");
  MakeHandle([&](int, Words, Tcl_Interp* interp) {
    EXPECT_EQ(Tcl_Eval(interp, "rename $other {}"), TCL_OK);
    EXPECT_EQ(other_log.deleted, 1);
    return TCL_OK;
  });
  EXPECT_EQ(tcl_.Eval("$h x"), "");
  EXPECT_EQ(log_.deleted, 0);
}

// A handle whose end ends another one.
class ChainedHandle : public LoggedHandle {
 public:
  ChainedHandle(HandleLog* log, Tcl_Interp* interp, Script::PtrHandleBase* next)
      : LoggedHandle(log, interp), next_(next) {}
  void Detached() override {
    LoggedHandle::Detached();
    delete next_;
  }

 private:
  Script::PtrHandleBase* next_;
};

TEST(HandleCommandChain, EndsWithTheInterpreter) {
  Interpreter tcl;
  HandleLog log;
  auto* const last = new LoggedHandle(&log, tcl.get());
  auto* const first = new ChainedHandle(&log, tcl.get(), last);
  first->GetTclObj();
  const std::string name = first->GetString();
  last->GetTclObj();
  EXPECT_EQ(tcl.Eval("rename " + name + " {}"), "");
  EXPECT_EQ(log.deleted, 2);
  // Detached is heard by the handle whose command ended, not by one that native code deleted.
  EXPECT_EQ(log.detached, 1);
  tcl.End();
  EXPECT_EQ(log.deleted, 2);
}

// What the script has written must come out before what native code prints during the call.
TEST(HandleOutput, KeepsTheOrderOfPutsAndNativePrinting) {
  testing::internal::CaptureStdout();
  const Interpreter tcl;
  HandleLog log;
  (new LoggedHandle(&log, tcl.get(), [](int, Words, Tcl_Interp*) {
    std::fputs("native\n", stdout);
    std::fflush(stdout);
    return TCL_OK;
  }))->SetVariable(tcl.get(), "h");
  EXPECT_EQ(tcl.Eval("fconfigure stdout -buffering full; puts before; $h x; puts after; "
                     "flush stdout"),
            "");
  EXPECT_EQ(testing::internal::GetCapturedStdout(), "before\nnative\nafter\n");
}

}  // namespace

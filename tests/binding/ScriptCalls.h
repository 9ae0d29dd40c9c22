// An interpreter for tests, and words with which a test calls a handle without one.
#ifndef VORKEL_TESTS_BINDING_SCRIPTCALLS_H_
#define VORKEL_TESTS_BINDING_SCRIPTCALLS_H_

// Tests call the Tcl library that they are linked with; the binding calls it through the stubs
// table, and its headers would have everything else do the same.
#undef USE_TCL_STUBS
#include <tcl.h>

#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "binding/TclCalls.h"
#include "host/Script_Handle.h"

// A Tcl interpreter that ends with the object.
class TestInterp {
 public:
  TestInterp() : interp_(Tcl_CreateInterp()) {}
  ~TestInterp() {
    if (interp_ != nullptr) Tcl_DeleteInterp(interp_);
  }
  TestInterp(const TestInterp&) = delete;
  TestInterp& operator=(const TestInterp&) = delete;

  Tcl_Interp* get() const { return interp_; }

  // The status of a script; its result is in Result().
  int Eval(const std::string& script) { return Tcl_Eval(interp_, script.c_str()); }

  std::string Result() const { return Tcl_GetStringResult(interp_); }
  void SetResult(const std::string& text) {
    Tcl_SetObjResult(interp_, Tcl_NewStringObj(text.c_str(), -1));
  }

  void End() {
    Tcl_DeleteInterp(interp_);
    interp_ = nullptr;
  }

 private:
  Tcl_Interp* interp_;
};

// An interpreter of a process in which the binding can call Tcl, as after the package is loaded.
class BoundInterp : public TestInterp {
 public:
  BoundInterp() {
    if (!Tcl::Bind(get())) std::abort();
  }
};

// A word of a script call that stands for no native object.
class TextWord : public Script::Handle {
 public:
  explicit TextWord(const std::string& text) : object_(Tcl_NewStringObj(text.c_str(), -1)) {
    Tcl_IncrRefCount(object_);
  }
  ~TextWord() override { Tcl_DecrRefCount(object_); }

  Tcl_Obj* GetTclObj() const override {
    ++reads_;
    return object_;
  }
  const char* GetString() const override {
    ++reads_;
    return Tcl_GetString(object_);
  }
  int SetResult(Tcl_Interp*) override { return TCL_ERROR; }
  int SetVariable(Tcl_Interp*, const char*) override { return TCL_ERROR; }
  Script::Handle* CreateHandle(Tcl_Interp*) const override { return nullptr; }
  Script::PtrHandleBase* GetPtrHandleBase() const override { return nullptr; }

  // How often the word was looked at.
  int Reads() const { return reads_; }

 private:
  Tcl_Obj* object_;
  mutable int reads_ = 0;
};

// The words of one call: the handle itself, then texts.
class TestWords {
 public:
  TestWords(const Script::Handle& handle, const std::vector<std::string>& texts) {
    pointers_.push_back(&handle);
    for (const std::string& text : texts) {
      words_.push_back(std::make_unique<TextWord>(text));
      pointers_.push_back(words_.back().get());
    }
  }

  int Count() const { return static_cast<int>(pointers_.size()); }
  const Script::Handle* const* Data() const { return pointers_.data(); }

  // How often the words behind the method name were looked at.
  int ArgumentReads() const {
    int reads = 0;
    for (std::size_t i = 1; i < words_.size(); ++i) reads += words_[i]->Reads();
    return reads;
  }

 private:
  std::vector<std::unique_ptr<TextWord>> words_;
  std::vector<const Script::Handle*> pointers_;
};

// A method name followed by `arguments` times the word "1".
inline std::vector<std::string> NameAndArguments(const std::string& method, int arguments) {
  std::vector<std::string> texts(static_cast<std::size_t>(arguments) + 1, "1");
  texts[0] = method;
  return texts;
}

#endif  // VORKEL_TESTS_BINDING_SCRIPTCALLS_H_

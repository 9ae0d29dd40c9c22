// Words with which a test calls a handle in the Tcl of FakeStubs.
#ifndef VORKEL_TESTS_BINDING_FAKEWORDS_H_
#define VORKEL_TESTS_BINDING_FAKEWORDS_H_

#include <tcl.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "host/Script_Handle.h"
#include "tests/binding/FakeStubs.h"

// A word whose Tcl object is its text. It notes among the reads of FakeStubs when it is asked for
// that.
class FakeWord : public Script::Handle {
 public:
  explicit FakeWord(std::string text) : text_(std::move(text)) {}
  Tcl_Obj* GetTclObj() const override {
    FakeStubs::Instance().reads.push_back("object " + text_);
    return FakeStubs::ObjectOf(text_);
  }
  // The text of a word is that of its Tcl object.
  const char* GetString() const override { return "not the text of the object"; }
  int SetResult(Tcl_Interp*) override { return TCL_ERROR; }
  int SetVariable(Tcl_Interp*, const char*) override { return TCL_ERROR; }
  Script::Handle* CreateHandle(Tcl_Interp*) const override { return nullptr; }
  Script::PtrHandleBase* GetPtrHandleBase() const override { return nullptr; }

 private:
  std::string text_;
};

// Calls a handle with a method name and arguments. FakeStubs notes what comes of it, and nothing
// from before.
inline int ExecuteFake(Script::Handle& handle, const std::vector<std::string>& texts) {
  FakeStubs::Instance() = FakeStubs{};
  std::vector<std::unique_ptr<FakeWord>> words;
  std::vector<const Script::Handle*> pointers = {&handle};
  for (const std::string& text : texts) {
    words.push_back(std::make_unique<FakeWord>(text));
    pointers.push_back(words.back().get());
  }
  return handle.Execute(static_cast<int>(pointers.size()), pointers.data(), FakeStubs::Interp());
}

#endif  // VORKEL_TESTS_BINDING_FAKEWORDS_H_

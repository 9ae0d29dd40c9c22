// The words of a script call, as handles.
//
// A call wraps every word for the time that it lasts. That is on the path of every method
// call, so up to kInlineWords words need no memory from the heap.
//
// Tested by handle_call_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_SCRIPT_WORDHANDLE_H_
#define VORKEL_HOST_BUNDLED_SCRIPT_WORDHANDLE_H_

#include <tcl.h>

#include <array>
#include <cstddef>
#include <memory>

#include "host/Script_Handle.h"

namespace Script {

// One word. Stands for no native object, and borrows the Tcl object from the caller.
class WordHandle final : public Handle {
 public:
  explicit WordHandle(Tcl_Obj* word) : word_(word) {}

  Tcl_Obj* GetTclObj() const override { return word_; }
  const char* GetString() const override;
  int SetResult(Tcl_Interp* interp) override;
  int SetVariable(Tcl_Interp* interp, const char* name) override;
  Handle* CreateHandle(Tcl_Interp*) const override { return nullptr; }
  PtrHandleBase* GetPtrHandleBase() const override { return nullptr; }

 private:
  Tcl_Obj* word_;
};

// The words of one call: the handle that is called, then the others.
class WordList {
 public:
  // `objv` must outlive the list. `objc` is at least 1; objv[0], the word by which the script
  // called `self`, is not looked at.
  WordList(const Handle* self, int objc, Tcl_Obj* const objv[]);
  WordList(const WordList&) = delete;
  WordList& operator=(const WordList&) = delete;

  const Handle* const* handles() const { return handles_; }

 private:
  static constexpr std::size_t kInlineWords = 16;

  const Handle** handles_;
  // The places of the words and of the array above: inline, or for long calls on the heap. The
  // words own nothing, so they end with their places, without their destructors.
  alignas(WordHandle) std::array<std::byte, kInlineWords * sizeof(WordHandle)> inline_words_;
  std::array<const Handle*, kInlineWords> inline_handles_;
  std::unique_ptr<std::byte[]> heap_words_;
  std::unique_ptr<const Handle*[]> heap_handles_;
};

}  // namespace Script

#endif  // VORKEL_HOST_BUNDLED_SCRIPT_WORDHANDLE_H_

#include "host/bundled/script/WordHandle.h"

#include "host/bundled/script/TclAccess.h"

namespace Script {

const char* WordHandle::GetString() const { return Tcl_GetString(word_); }

int WordHandle::SetResult(Tcl_Interp* interp) { return SetResultObject(interp, word_); }

int WordHandle::SetVariable(Tcl_Interp* interp, const char* name) {
  return SetVariableObject(interp, name, word_);
}

WordList::WordList(const Handle* self, int objc, Tcl_Obj* const objv[]) {
  const std::size_t count = static_cast<std::size_t>(objc) - 1;  // not counting `self`
  std::byte* place = inline_words_.data();
  handles_ = inline_handles_.data();
  if (count >= kInlineWords) {
    heap_words_.reset(new std::byte[count * sizeof(WordHandle)]);
    heap_handles_.reset(new const Handle*[count + 1]);
    place = heap_words_.get();
    handles_ = heap_handles_.get();
  }
  auto* const words = reinterpret_cast<WordHandle*>(place);
  handles_[0] = self;
  for (std::size_t i = 0; i < count; ++i) {
    handles_[i + 1] = std::construct_at(words + i, objv[i + 1]);
  }
}

}  // namespace Script

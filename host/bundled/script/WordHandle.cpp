#include "host/bundled/script/WordHandle.h"

#include "host/bundled/script/TclAccess.h"

namespace Script {

const char* WordHandle::GetString() const { return Tcl_GetString(word_); }

int WordHandle::SetResult(Tcl_Interp* interp) { return SetResultObject(interp, word_); }

int WordHandle::SetVariable(Tcl_Interp* interp, const char* name) {
  return SetVariableObject(interp, name, word_);
}

WordList::WordList(const Handle* self, int objc, Tcl_Obj* const objv[])
    : word_count_(static_cast<std::size_t>(objc) - 1) {
  std::byte* place = inline_words_.data();
  handles_ = inline_handles_.data();
  if (word_count_ >= kInlineWords) {
    heap_words_.reset(new std::byte[word_count_ * sizeof(WordHandle)]);
    heap_handles_.reset(new const Handle*[word_count_ + 1]);
    place = heap_words_.get();
    handles_ = heap_handles_.get();
  }
  words_ = reinterpret_cast<WordHandle*>(place);
  handles_[0] = self;
  for (std::size_t i = 0; i < word_count_; ++i) {
    handles_[i + 1] = std::construct_at(words_ + i, objv[i + 1]);
  }
}

WordList::~WordList() { std::destroy_n(words_, word_count_); }

}  // namespace Script

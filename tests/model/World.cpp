#include "tests/model/World.h"

namespace model {

namespace {

constexpr const char* kHandle = "::Script::handle";

}  // namespace

std::string Nameless(const std::string& text) {
  std::string nameless;
  for (std::size_t at = 0; at < text.size();) {
    if (text.compare(at, std::char_traits<char>::length(kHandle), kHandle) == 0) {
      nameless += "HANDLE";
      at += std::char_traits<char>::length(kHandle);
      while (at < text.size() && text[at] >= '0' && text[at] <= '9') ++at;
    } else {
      nameless += text[at++];
    }
  }
  return nameless;
}

Answer World::Rename(const Step& step) {
  Handle& handle = handles_[step.handle];
  const std::string& wanted = step.words.front();
  const std::string shown = handle.name.empty() ? "HANDLE" : handle.name;
  if (handle.object == nullptr) {
    return {false, "can't rename \"" + shown + "\": command doesn't exist", {}, {}};
  }
  if (names_[wanted]) {
    return {false, "can't rename to \"" + wanted + "\": command already exists", {}, {}};
  }
  names_[handle.name] = false;
  names_[wanted] = true;
  handle.name = wanted;
  return {true, wanted, {}, {}};
}

Answer World::Expect(const Step& step) {
  if (step.kind == Step::Kind::kCreate) {
    handles_[step.handle] = {"", std::make_shared<ObjectModel>()};
    return {true, "HANDLE", {}, {}};
  }
  const auto found = handles_.find(step.handle);
  if (found == handles_.end()) {
    return {false, "can't read \"h" + std::to_string(step.handle) + "\": no such variable", {}, {}};
  }
  if (step.kind == Step::Kind::kRename) return Rename(step);
  Handle& handle = found->second;
  const std::string shown = handle.name.empty() ? "HANDLE" : handle.name;
  if (step.kind == Step::Kind::kDestroy) {
    if (handle.object == nullptr) {
      return {false, "can't delete \"" + shown + "\": command doesn't exist", {}, {}};
    }
    handle.object = nullptr;
    names_[handle.name] = false;
    return {true, "", {}, {}};
  }
  if (handle.object == nullptr) return {false, "invalid command name \"" + shown + "\"", {}, {}};
  return handle.object->Call(step.words);
}

bool World::GoesFar(const Step& step) const {
  const auto found = handles_.find(step.handle);
  return step.kind == Step::Kind::kCall && found != handles_.end() &&
         found->second.object != nullptr && found->second.object->GoesFar(step.words);
}

}  // namespace model

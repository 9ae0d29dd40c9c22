#include "tests/model/World.h"

namespace model {

namespace {

constexpr const char* kHandle = "::Script::handle";

// The names of commands that no script has renamed stand for those that the host gives them.
constexpr char kOwnName = '#';
std::string Shown(const std::string& name) {
  return name.starts_with(kOwnName) ? "HANDLE" : name;
}

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

ObjectModel* World::ObjectOf(int variable) const {
  const auto name = variables_.find(variable);
  if (name == variables_.end()) return nullptr;
  const auto command = commands_.find(name->second);
  return command == commands_.end() ? nullptr : command->second.get();
}

Answer World::Rename(const std::string& name, const std::string& wanted) {
  if (commands_.contains(wanted)) {
    return {false, "can't rename to \"" + wanted + "\": command already exists", {}, {}};
  }
  commands_[wanted] = commands_[name];
  commands_.erase(name);
  return {true, wanted, {}, {}};
}

Answer World::Expect(const Step& step) {
  const std::string variable = std::to_string(step.handle);
  if (step.kind == Step::Kind::kCreate) {
    const std::string name = kOwnName + std::to_string(++created_);
    variables_[step.handle] = name;
    commands_[name] = std::make_shared<ObjectModel>();
    return {true, "HANDLE", {}, {}};
  }
  const auto found = variables_.find(step.handle);
  if (found == variables_.end()) {
    return {false, "can't read \"h" + variable + "\": no such variable", {}, {}};
  }
  const std::string name = found->second;
  ObjectModel* const object = ObjectOf(step.handle);
  const bool is_there = object != nullptr;
  switch (step.kind) {
    case Step::Kind::kRename: {
      if (!is_there) {
        return {false, "can't rename \"" + Shown(name) + "\": command doesn't exist", {}, {}};
      }
      Answer answer = Rename(name, step.words.front());
      if (answer.is_ok) variables_[step.handle] = step.words.front();
      return answer;
    }
    case Step::Kind::kDestroy:
      if (!is_there) {
        return {false, "can't delete \"" + Shown(name) + "\": command doesn't exist", {}, {}};
      }
      commands_.erase(name);
      return {};
    default:
      break;
  }
  if (!is_there) return {false, "invalid command name \"" + Shown(name) + "\"", {}, {}};
  return object->Call(step.words);
}

bool World::GoesFar(const Step& step) const {
  const ObjectModel* const object = ObjectOf(step.handle);
  return step.kind == Step::Kind::kCall && object != nullptr && object->GoesFar(step.words);
}

}  // namespace model

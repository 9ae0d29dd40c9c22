// What a script finds: the handles that it has made, by the variables that hold them.
#ifndef VORKEL_TESTS_MODEL_WORLD_H_
#define VORKEL_TESTS_MODEL_WORLD_H_

#include <map>
#include <memory>
#include <string>

#include "tests/model/Step.h"

namespace model {

class World {
 public:
  virtual ~World() = default;

  // What the step is to answer.
  virtual Answer Expect(const Step& step);

  // Whether the plain search of the step would take seconds.
  bool GoesFar(const Step& step) const;

 private:
  struct Handle {
    std::string name;  // of the command, if the script has given it one
    std::shared_ptr<ObjectModel> object;  // null: the command is no more
  };

  Answer Rename(const Step& step);

  std::map<int, Handle> handles_;
  // The names that scripts have given to commands, those that no variable holds among them.
  std::map<std::string, bool> names_;
};

// The parts of an answer of Tcl that tell of no names of handles, which differ from run to run.
std::string Nameless(const std::string& text);

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_WORLD_H_

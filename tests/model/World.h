// What a script finds: the commands of the handles that it has made, and the variables that name them.
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
  Answer Rename(const std::string& name, const std::string& wanted);
  // Null when no command has the name that the variable holds.
  ObjectModel* ObjectOf(int variable) const;

  // A variable holds the name of a command, which may be no more, or be another one by now.
  std::map<int, std::string> variables_;
  std::map<std::string, std::shared_ptr<ObjectModel>> commands_;
  int created_ = 0;
};

// The parts of an answer of Tcl that tell of no names of handles, which differ from run to run.
std::string Nameless(const std::string& text);

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_WORLD_H_

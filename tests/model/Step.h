// A line of a script that works with handles, which it keeps in the variables h0, h1 and so on.
#ifndef VORKEL_TESTS_MODEL_STEP_H_
#define VORKEL_TESTS_MODEL_STEP_H_

#include <string>
#include <vector>

#include "tests/model/ObjectModel.h"

namespace model {

struct Step {
  enum class Kind {
    kCreate,   // into the variable, whatever it held
    kRename,   // the command, to words[0]; the variable then holds that
    kDestroy,  // the command; the variable stays
    kCall,     // with the words
  };
  Kind kind = Kind::kCall;
  int handle = 0;
  Words words = {};
  bool operator==(const Step&) const = default;
};
using Steps = std::vector<Step>;

// As a script has it.
std::string TextOf(const Step& step);

// A list of Tcl.
std::string List(const Words& words);

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_STEP_H_

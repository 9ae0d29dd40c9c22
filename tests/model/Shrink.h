// Fewer steps that still differ from the model.
#ifndef VORKEL_TESTS_MODEL_SHRINK_H_
#define VORKEL_TESTS_MODEL_SHRINK_H_

#include "tests/model/Session.h"

namespace model {

// Leaves out steps, then shortens words, as long as there is a difference: of what is left, nothing
// can be left out. `steps` have one.
Steps Shrunk(Steps steps, const NewWorld& new_world, bool far = false);

// A file of tcltest that replays the steps: `name` is that of its test. Each line of the script is
// expected to answer what the model says.
std::string TclTest(const std::string& name, const Steps& steps, const NewWorld& new_world,
                    const std::map<std::string, std::string>& devices = {});

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_SHRINK_H_

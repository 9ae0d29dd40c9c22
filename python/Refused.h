// What is refused, on its way to Python: the package's own functions (vorkel/_errors.py) raise it,
// and get it as data.
#ifndef VORKEL_PYTHON_REFUSED_H_
#define VORKEL_PYTHON_REFUSED_H_

#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/device/Catalogue.h"
#include "planner/read/Mistake.h"

namespace python {

// A function of vorkel._errors, and what it takes, in JSON.
struct Refused {
  std::string function;
  std::string data;
};

// JSON in one line. Bytes that are no UTF-8 are replaced.
std::string Text(const nlohmann::ordered_json& data);

// Each throws Refused.
[[noreturn]] void RefuseMistakes(const planner::read::Mistakes& mistakes);
// The same for arguments that the planner reads as options: they are named as Python has them.
[[noreturn]] void RefuseArguments(const planner::read::Mistakes& mistakes);
// One mistake of an entry, with its sentence.
[[noreturn]] void RefuseEntry(const std::string& kind, const std::string& entry,
                              const std::string& text, const std::string& message);
[[noreturn]] void RefusePart(const planner::device::PartError& error);
// Answers that are not solved.
[[noreturn]] void RefuseUnsolved(const std::vector<planner::Answer>& refused,
                                 const planner::Device& device);

}  // namespace python

#endif  // VORKEL_PYTHON_REFUSED_H_

// Settings of the caller's own, and what they make.
#ifndef VORKEL_PYTHON_EVALUATION_H_
#define VORKEL_PYTHON_EVALUATION_H_

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "planner/Answer.h"
#include "python/Asked.h"

namespace python {

class Evaluation {
 public:
  // A setting, "phase_steps", and its value as text.
  using Setting = std::pair<std::string, std::string>;

  // The request has the inputs and what the settings are to be compared with. `plan` is one in
  // JSON, of which the answer with a number counts, or the first; what the request and the settings
  // say goes before. Throws Refused.
  Evaluation(const std::string& request, const std::vector<Setting>& settings,
             const std::optional<std::string>& plan, const std::optional<int>& number);

  const Asked& asked() const { return asked_; }
  const planner::Answer& answer() const { return answer_; }

  std::string Json() const;
  std::string Tcl() const;
  std::string Report(int width) const;

 private:
  Asked asked_;
  planner::Answer answer_;
};

}  // namespace python

#endif  // VORKEL_PYTHON_EVALUATION_H_

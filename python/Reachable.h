// Which frequencies an output can have.
#ifndef VORKEL_PYTHON_REACHABLE_H_
#define VORKEL_PYTHON_REACHABLE_H_

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "planner/reach/Reach.h"
#include "planner/report/ReachText.h"
#include "python/Asked.h"

namespace python {

// Each answer is a document of doc/reach.md.
class Reachable {
 public:
  // Of the output at a place, from 0; `lowest` and `highest` are values with or without a unit,
  // both included. Throws Refused.
  Reachable(const std::string& request, int output, const std::optional<std::string>& lowest,
            const std::optional<std::string>& highest);

  std::string All(std::int64_t most) const;  // 0: all of them
  std::string Near(const std::string& frequency, std::int64_t most) const;
  std::string Gaps(std::int64_t most) const;
  std::string Count() const;

 private:
  std::string Json(const planner::report::ReachQuestion& question) const;

  Asked asked_;
  std::vector<planner::Primitive> primitives_;
  planner::report::ReachQuestion question_;  // what is the same for all of them
};

}  // namespace python

#endif  // VORKEL_PYTHON_REACHABLE_H_

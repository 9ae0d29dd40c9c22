// Frequencies that an output can have, as text, JSON, rows for a spreadsheet and a Tcl dict.
// doc/reach.md describes them.
//
// Lists can be longer than memory, so that text, JSON and rows are made piece by piece.
//
// Tested by reach_text_test.cpp and reach.test.
#ifndef VORKEL_PLANNER_REPORT_REACHTEXT_H_
#define VORKEL_PLANNER_REPORT_REACHTEXT_H_

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/reach/Find.h"
#include "planner/report/Style.h"

namespace planner::report {

// Counts up when an entry goes, is added, or changes its meaning or type.
inline constexpr int kReachVersion = 1;

// What is asked for.
struct ReachQuestion {
  enum class Kind { kList, kCount, kGaps, kNear };
  Kind kind = Kind::kList;
  int output = 0;
  std::optional<Rational> from = {};  // MHz
  std::optional<Rational> to = {};
  Rational near = 0;      // kNear, MHz
  std::int64_t most = 0;  // of a list, gaps or nearest ones; 0: all of a list

  // The range of it all, as far as a primitive goes.
  Range Within(const reach::Reach& reach) const;
};

enum class ReachForm { kText, kJson, kCsv };

// Where the pieces go; false: no more are wanted.
using Sink = std::function<bool(const std::string&)>;

// Writes all that is asked for, of one primitive after the other. Answers how many frequencies,
// gaps or nearest ones there were, shown or not; of a count the count.
std::int64_t WriteReach(const Request& request, const Device& device, const ReachQuestion& question,
                        const std::vector<Primitive>& primitives, ReachForm form, const Sink& sink);

// The same as a Tcl dict.
std::int64_t WriteReachTcl(const Request& request, const Device& device,
                           const ReachQuestion& question, const std::vector<Primitive>& primitives,
                           std::string* dict);

// That there is nothing in reach, for standard error.
std::string NothingInReachText(const ReachQuestion& question, const Device& device,
                               const std::vector<Primitive>& primitives);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_REACHTEXT_H_

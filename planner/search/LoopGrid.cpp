// Tested by loop_grid_test.cpp.
#include "planner/search/LoopGrid.h"

#include <algorithm>
#include <limits>

#include "hardware/Loop.h"
#include "planner/search/Factor.h"

namespace planner::search {

namespace {

using hardware::kEighths;

// The smallest and the largest whole number n, up to `most`, with which quotient x n stays in a
// range. A limit that is not above 0 holds nothing below, or leaves nothing above.
class Ends {
 public:
  // Lowest <= low x n / a and high x n / a <= highest, for an `a` that is told later.
  Ends(const Rational& low, const Rational& high, const Range& range)
      : has_lowest_(range.lowest > 0), is_empty_(range.highest <= 0) {
    if (has_lowest_) lowest_ = Factor(range.lowest / low);
    if (!is_empty_) highest_ = Factor(range.highest / high);
  }
  std::int64_t First(std::int64_t a, std::int64_t most) const {
    return has_lowest_ ? lowest_.Ceiling(a, most) : 0;
  }
  std::int64_t Last(std::int64_t a, std::int64_t most) const {
    return is_empty_ ? 0 : highest_.Floor(a, most);
  }
  double Lowest() const { return has_lowest_ ? lowest_.Approximate() : 0; }
  double Highest() const { return is_empty_ ? 0 : highest_.Approximate(); }

 private:
  bool has_lowest_;
  bool is_empty_;
  Factor lowest_;
  Factor highest_;
};

}  // namespace

Inputs InputsOf(const std::vector<Rational>& inputs) {
  Inputs ends = {inputs.front(), inputs.front()};
  for (const Rational& input : inputs) {
    ends.lowest = std::min(ends.lowest, input);
    ends.highest = std::max(ends.highest, input);
  }
  return ends;
}

MSet MSetOf(Primitive primitive, bool fractions) {
  const bool has_gap = primitive == Primitive::kTsyn;
  return {.first = (has_gap ? hardware::kSmallestTsynM : 1) * kEighths,
          .last = hardware::kLargestM * kEighths,
          .step = fractions ? 1 : kEighths,
          .one = has_gap};
}

std::int64_t LoopGrid::Count() const {
  std::int64_t count = 0;
  for (const Row& row : rows) {
    if (row.last >= row.first) count += (row.last - row.first) / step + 1;
    if (row.one) ++count;
  }
  return count;
}

LoopGrid LoopGridOf(const Inputs& inputs, const MSet& m, int largest_d,
                    const std::optional<Range>& vco, const std::optional<Range>& pfd) {
  LoopGrid grid;
  grid.step = m.step;
  // M in eighths lies between d times these.
  std::optional<Ends> vcos;
  if (vco) vcos.emplace(inputs.lowest / kEighths, inputs.highest / kEighths, *vco);
  int first_d = 1;
  int last_d = largest_d;
  if (pfd) {
    // input / D <= highest: D >= input / highest.
    if (pfd->highest <= 0) return grid;
    first_d = std::max(
        first_d, static_cast<int>(Factor(inputs.highest / pfd->highest).Ceiling(1, largest_d + 1)));
    if (pfd->lowest > 0) {
      last_d = static_cast<int>(Factor(inputs.lowest / pfd->lowest).Floor(1, largest_d));
    }
  }
  for (int d = first_d; d <= last_d; ++d) {
    const int low = vcos ? static_cast<int>(vcos->First(d, m.last + 1)) : 0;
    const int high = vcos ? static_cast<int>(vcos->Last(d, m.last)) : m.last;
    // To multiples of the step.
    const int first = std::max(m.first, (low + m.step - 1) / m.step * m.step);
    const int last = std::min(m.last, high / m.step * m.step);
    const bool one = m.one && low <= kEighths && kEighths <= high;
    if (first <= last || one) grid.rows.push_back({d, first, last, one});
  }
  constexpr double kWider = 1e-12;
  grid.lowest = vcos ? vcos->Lowest() * (1 - kWider) : 0;
  grid.highest = vcos ? vcos->Highest() * (1 + kWider) : m.last;
  return grid;
}

}  // namespace planner::search

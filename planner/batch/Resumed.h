// Lines of answers that an earlier run has written.
//
// Each begins with the same entries in the same order (report/BatchText.h writes them):
//
//     {"line":17,"digest":"00f1e2d3c4b5a697","status":"within","primitive":"TSYN","id":...}
//
// Tested by resumed_test.cpp.
#ifndef VORKEL_PLANNER_BATCH_RESUMED_H_
#define VORKEL_PLANNER_BATCH_RESUMED_H_

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "planner/batch/Outcome.h"

namespace planner::batch {

// What stands at the beginning of an answer.
struct Head {
  std::int64_t line = 0;
  std::uint64_t digest = 0;
  Status status = Status::kFailed;
  std::optional<Primitive> primitive;
  bool operator==(const Head&) const = default;
};

// Without the brace that ends an object.
std::string TextOf(const Head& head);
// Nothing when the text does not begin with one.
std::optional<Head> ReadHead(std::string_view text);

// So many bytes are enough for a head.
inline constexpr std::size_t kMostOfHead = 160;

}  // namespace planner::batch

#endif  // VORKEL_PLANNER_BATCH_RESUMED_H_

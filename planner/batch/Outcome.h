// What becomes of a line of a batch.
#ifndef VORKEL_PLANNER_BATCH_OUTCOME_H_
#define VORKEL_PLANNER_BATCH_OUTCOME_H_

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "planner/Device.h"
#include "planner/device/Catalogue.h"
#include "planner/plan/Plan.h"
#include "planner/read/Mistake.h"
#include "planner/read/Tree.h"

namespace planner::batch {

enum class Status {
  kWithin,    // planned, and the best answer is as asked for
  kOff,       // planned, but something of the best is outside its tolerance or range
  kUnsolved,  // there are no settings
  kWrong,     // the line is no request
  kFailed,    // the program itself has failed
};
inline constexpr std::array kStatuses = {Status::kWithin, Status::kOff, Status::kUnsolved,
                                         Status::kWrong, Status::kFailed};

constexpr std::string_view Name(Status status) {
  switch (status) {
    case Status::kWithin:
      return "within";
    case Status::kOff:
      return "off";
    case Status::kUnsolved:
      return "unsolved";
    case Status::kWrong:
      return "wrong";
    case Status::kFailed:
      break;
  }
  return "failed";
}

// Why a line is wrong, beside what a request can be.
enum class Trouble {
  kNone,
  kTooLong,      // the line
  kNoPrimitive,  // `device` has not the one that is asked for, or none at all
};

struct Outcome {
  std::int64_t line = 0;
  std::uint64_t digest = 0;
  std::optional<read::Node> id;  // a string or a number
  Status status = Status::kFailed;

  std::shared_ptr<const Device> device;
  std::optional<plan::Plan> plan;  // kWithin, kOff and kUnsolved

  // kWrong:
  read::Mistakes mistakes;
  std::optional<device::PartError> part;
  Trouble trouble = Trouble::kNone;
  std::optional<Primitive> lacking;  // kNoPrimitive: the one that is asked for

  std::string failure;  // kFailed: what the program says of it

  // The primitive of the best answer.
  std::optional<Primitive> Best() const {
    if (!plan || !plan->IsSolved()) return std::nullopt;
    return plan->ranked.front().primitive;
  }
};

// How many lines have become what.
struct Counts {
  // By status and primitive; the last is for those that have none.
  std::array<std::array<std::int64_t, hardware::kPrimitives.size() + 1>, kStatuses.size()> of{};
  std::array<std::int64_t, kStatuses.size()> first{};  // the first such line; 0: none

  void Add(std::int64_t line, Status status, std::optional<Primitive> primitive) {
    const auto row = static_cast<std::size_t>(status);
    ++of[row][primitive ? static_cast<std::size_t>(*primitive) : hardware::kPrimitives.size()];
    if (first[row] == 0) first[row] = line;
  }
  std::int64_t Of(Status status) const {
    std::int64_t sum = 0;
    for (const std::int64_t count : of[static_cast<std::size_t>(status)]) sum += count;
    return sum;
  }
  std::int64_t All() const {
    std::int64_t sum = 0;
    for (const Status status : kStatuses) sum += Of(status);
    return sum;
  }
};

}  // namespace planner::batch

#endif  // VORKEL_PLANNER_BATCH_OUTCOME_H_

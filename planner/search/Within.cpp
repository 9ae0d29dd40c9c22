// Tested by within_test.cpp.
#include "planner/search/Within.h"

#include "planner/answer/Corners.h"
#include "planner/answer/Evaluate.h"
#include "planner/search/KruWithin.h"
#include "planner/search/LoopWithin.h"

namespace planner::search {

// Neither where the primitive cannot be asked at all.
struct Asked {
  std::optional<LoopWithin> loop;
  std::optional<KruWithin> kru;

  Asked(const Request& request, const Device& device, Primitive primitive) {
    if (!device.Has(primitive) || !answer::Refusals(request, primitive).empty()) return;
    if (hardware::IsLoop(primitive)) {
      loop.emplace(request, device, primitive);
    } else {
      kru.emplace(request, device, primitive);
    }
  }

  std::optional<Settings> Find(const Relaxed& relaxed) const {
    if (loop) return loop->Find(relaxed);
    if (kru) return kru->Find(relaxed);
    return std::nullopt;
  }
};

struct Within::Implementation {
  Implementation(const Request& request, const Device& device, Primitive primitive)
      : nominal(request, device, primitive) {
    if (request.input_tolerance == 0) return;
    in_corners.emplace(request, answer::Narrowed(device, request.input_tolerance), primitive);
  }

  Asked nominal;
  std::optional<Asked> in_corners;  // with a tolerance of the inputs
};

Within::Within(const Request& request, const Device& device, Primitive primitive)
    : implementation_(std::make_unique<const Implementation>(request, device, primitive)) {}

Within::~Within() = default;
Within::Within(Within&&) noexcept = default;
Within& Within::operator=(Within&&) noexcept = default;

bool Within::Exists(const Relaxed& relaxed) const { return Find(relaxed).has_value(); }

std::optional<Settings> Within::Find(const Relaxed& relaxed) const {
  const bool is_nominal = relaxed.input_tolerance || !implementation_->in_corners;
  return (is_nominal ? implementation_->nominal : *implementation_->in_corners).Find(relaxed);
}

}  // namespace planner::search

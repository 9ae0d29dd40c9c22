// Tested by within_test.cpp.
#include "planner/search/Within.h"

#include "planner/answer/Evaluate.h"
#include "planner/search/KruWithin.h"
#include "planner/search/LoopWithin.h"

namespace planner::search {

// Neither where the primitive cannot be asked at all.
struct Within::Implementation {
  std::optional<LoopWithin> loop;
  std::optional<KruWithin> kru;
};

Within::Within(const Request& request, const Device& device, Primitive primitive) {
  auto implementation = std::make_unique<Implementation>();
  if (device.Has(primitive) && answer::Refusals(request, primitive).empty()) {
    if (hardware::IsLoop(primitive)) {
      implementation->loop.emplace(request, device, primitive);
    } else {
      implementation->kru.emplace(request, device, primitive);
    }
  }
  implementation_ = std::move(implementation);
}

Within::~Within() = default;
Within::Within(Within&&) noexcept = default;
Within& Within::operator=(Within&&) noexcept = default;

bool Within::Exists(const Relaxed& relaxed) const { return Find(relaxed).has_value(); }

std::optional<Settings> Within::Find(const Relaxed& relaxed) const {
  if (implementation_->loop) return implementation_->loop->Find(relaxed);
  if (implementation_->kru) return implementation_->kru->Find(relaxed);
  return std::nullopt;
}

}  // namespace planner::search

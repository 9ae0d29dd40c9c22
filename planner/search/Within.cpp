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

  Asked(const Request& request, const Device& device, Primitive primitive, const Asked* like) {
    if (!device.Has(primitive) || !answer::Refusals(request, primitive).empty()) return;
    if (hardware::IsLoop(primitive)) {
      loop.emplace(request, device, primitive,
                   like != nullptr && like->loop ? &*like->loop : nullptr);
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
  Implementation(const Request& request, const Device& device, Primitive primitive,
                 const Implementation* like)
      : nominal(request, device, primitive, like != nullptr ? &like->nominal : nullptr) {
    if (request.input_tolerance == 0) return;
    in_corners.emplace(request, answer::Narrowed(device, request.input_tolerance), primitive,
                       like != nullptr && like->in_corners ? &*like->in_corners : nullptr);
  }

  Asked nominal;
  std::optional<Asked> in_corners;  // with a tolerance of the inputs
};

Within::Within(const Request& request, const Device& device, Primitive primitive,
               const Within* like)
    : implementation_(std::make_unique<const Implementation>(
          request, device, primitive, like != nullptr ? like->implementation_.get() : nullptr)) {}

Within::~Within() = default;

bool Within::Exists(const Relaxed& relaxed) const { return Find(relaxed).has_value(); }

std::optional<Settings> Within::Find(const Relaxed& relaxed) const {
  const bool is_nominal = relaxed.input_tolerance || !implementation_->in_corners;
  return (is_nominal ? implementation_->nominal : *implementation_->in_corners).Find(relaxed);
}

}  // namespace planner::search

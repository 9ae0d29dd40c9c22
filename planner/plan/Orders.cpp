// Tested by orders_test.cpp.
#include "planner/plan/Orders.h"

#include <algorithm>
#include <cstddef>
#include <utility>

#include "hardware/Loop.h"

namespace planner::plan {

namespace {

using answer::PlaceOrder;

// The places that differ from all others of the primitive.
std::vector<int> OwnPlaces(const Request& request, const Device& device, Primitive primitive) {
  std::vector<int> places;
  switch (primitive) {
    case Primitive::kPll:
    case Primitive::kTsyn: {
      const LoopLimits& limits = device.Loop(primitive);
      const int outputs = static_cast<int>(request.outputs.size());
      if (hardware::HasFractions(primitive, outputs, request.whole_divider_0)) places.push_back(0);
      if (limits.output != limits.output_1) places.push_back(1);
      break;
    }
    case Primitive::kKruSp:
      if (device.Pins(primitive).usual != device.Pins(primitive).doubled) places.push_back(0);
      break;
    case Primitive::kKruClkgen:
      places.push_back(0);
      break;
  }
  std::erase_if(
      places, [&](int place) { return static_cast<std::size_t>(place) >= request.outputs.size(); });
  return places;
}

// The order with some outputs at the places that differ.
PlaceOrder OrderWith(std::size_t count, const std::vector<int>& places,
                     const std::vector<int>& outputs) {
  constexpr int kFree = -1;
  PlaceOrder order(count, kFree);
  for (std::size_t i = 0; i < places.size(); ++i) {
    order[static_cast<std::size_t>(places[i])] = outputs[i];
  }
  const auto is_placed = [&](int output) {
    return std::find(order.begin(), order.end(), output) != order.end();
  };
  for (std::size_t place = 0; place < count; ++place) {
    const int own = static_cast<int>(place);
    if (order[place] == kFree && !is_placed(own)) order[place] = own;
  }
  int next = 0;
  for (int& output : order) {
    if (output != kFree) continue;
    while (is_placed(next)) ++next;
    output = next;
  }
  return order;
}

bool SameDemands(const Output& a, const Output& b) {
  return a.used == b.used && (!a.used || a == b);
}

class Orders {
 public:
  Orders(const Request& request, std::vector<int> places)
      : request_(request), places_(std::move(places)) {
    Add(answer::AsRequested(request));
  }

  // Goes through all choices of outputs for the places that differ.
  void AddAll(std::vector<int>* chosen) {
    if (chosen->size() == places_.size()) {
      Add(OrderWith(request_.outputs.size(), places_, *chosen));
      return;
    }
    for (int output = 0; output < static_cast<int>(request_.outputs.size()); ++output) {
      if (std::find(chosen->begin(), chosen->end(), output) != chosen->end()) continue;
      chosen->push_back(output);
      AddAll(chosen);
      chosen->pop_back();
    }
  }

  std::vector<PlaceOrder> Take() { return std::move(orders_); }

 private:
  // One that has the same demands at all places that differ is there already.
  void Add(PlaceOrder order) {
    for (const PlaceOrder& other : orders_) {
      const bool is_same = std::all_of(places_.begin(), places_.end(), [&](int place) {
        return SameDemands(At(order, place), At(other, place));
      });
      if (is_same) return;
    }
    orders_.push_back(std::move(order));
  }

  const Output& At(const PlaceOrder& order, int place) const {
    return request_.outputs[static_cast<std::size_t>(order[static_cast<std::size_t>(place)])];
  }

  const Request& request_;
  const std::vector<int> places_;
  std::vector<PlaceOrder> orders_;
};

}  // namespace

std::vector<PlaceOrder> OrdersOf(const Request& request, const Device& device,
                                 Primitive primitive) {
  Orders orders(request, OwnPlaces(request, device, primitive));
  std::vector<int> chosen;
  orders.AddAll(&chosen);
  return orders.Take();
}

}  // namespace planner::plan

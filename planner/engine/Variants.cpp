// The ways to ask the engine that a request leaves open.
//
// Tested by variants_test.cpp.
#include "planner/engine/Ask.h"

namespace planner::engine {
namespace {

// A search that is worth it. A PLL or a TSYN that is asked for no phase and no duty cycle takes
// the smallest VCO; as the closest solution, a TSYN takes the VCO next to the one that is
// recommended, and a preference for the largest VCO counts.
struct Search {
  std::string_view name;
  bool closest = false;
  bool prefer_max_vco = false;
  bool whole_divider_0 = false;
  bool smallest = false;  // with phases or duty cycles the VCO is never the smallest as such
};

constexpr Search kPllSearches[] = {
    {.name = "smallest VCO"},
    {.name = "largest VCO", .closest = true, .prefer_max_vco = true},
};
constexpr Search kTsynSearches[] = {
    {.name = "smallest VCO", .smallest = true},
    {.name = "target VCO", .closest = true},
    {.name = "largest VCO", .closest = true, .prefer_max_vco = true},
    {.name = "integer divider 0", .whole_divider_0 = true},
};

// Whether a search is without a switch that the user has set, or is not what its name says.
bool Contradicts(const Request& request, const Search& search) {
  return (request.prefer_max_vco && !search.prefer_max_vco) ||
         (search.smallest && request.AsksForShape());
}

template <typename Searches>
std::vector<Variant> LoopVariants(const Request& request, const Searches& searches) {
  std::vector<Variant> variants;
  for (const Search& search : searches) {
    if (Contradicts(request, search)) continue;
    for (const Bandwidth bandwidth : hardware::kBandwidths) {
      if (request.bandwidth && *request.bandwidth != bandwidth) continue;
      variants.push_back({.name = std::string(search.name),
                          .bandwidth = bandwidth,
                          .closest = search.closest,
                          .prefer_max_vco = search.prefer_max_vco,
                          .whole_divider_0 = search.whole_divider_0 || request.whole_divider_0});
    }
  }
  return variants;
}

}  // namespace

Variant AsRequested(const Request& request) {
  return {.name = "",
          .bandwidth = request.bandwidth.value_or(Bandwidth::kOptimized),
          .closest = false,
          .prefer_max_vco = request.prefer_max_vco,
          .whole_divider_0 = request.whole_divider_0,
          .feedback = request.feedback};
}

std::vector<Variant> Variants(const Request& request, Primitive primitive) {
  switch (primitive) {
    case Primitive::kPll:
      return LoopVariants(request, kPllSearches);
    case Primitive::kTsyn:
      return LoopVariants(request, kTsynSearches);
    case Primitive::kKruSp:
      if (request.feedback) return {{.name = "feedback", .feedback = true}};
      return {{.name = "feedback", .feedback = true}, {.name = "no feedback", .feedback = false}};
    case Primitive::kKruClkgen:
      break;
  }
  return {{}};
}

}  // namespace planner::engine

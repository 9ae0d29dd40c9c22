#include "host/bundled/device/CoefficientTable.h"

#include <algorithm>
#include <iterator>

namespace Device {
namespace {

constexpr Coefficient kCoefficients[] = {
    {"LOOP_KAPPA", CoefficientGroup::kLoop},
    {"LOOP_KAPPA_VCO", CoefficientGroup::kLoop},
    {"LOOP_BANDWIDTH_LOW", CoefficientGroup::kLoop},
    {"LOOP_BANDWIDTH_OPTIMIZED", CoefficientGroup::kLoop},
    {"LOOP_BANDWIDTH_HIGH", CoefficientGroup::kLoop},
    {"LOOP_BUFFER_JITTER", CoefficientGroup::kLoop},
    {"LOOP_DETERMINISTIC_JITTER", CoefficientGroup::kLoop},
    {"LOOP_STATIC_OFFSET", CoefficientGroup::kLoop},
    {"LOOP_LEAKAGE", CoefficientGroup::kLoop},

    {"KRU_KAPPA", CoefficientGroup::kKru},
    {"KRU_TAP_STEP", CoefficientGroup::kKru},
    {"KRU_BUFFER_JITTER", CoefficientGroup::kKru},
    {"KRU_PHASE_ERROR", CoefficientGroup::kKru},
};

}  // namespace

std::span<const Coefficient> Coefficients() { return kCoefficients; }

std::optional<std::size_t> FindCoefficient(std::string_view name) {
  const auto found = std::find_if(
      std::begin(kCoefficients), std::end(kCoefficients),
      [name](const Coefficient& coefficient) { return coefficient.name == name; });
  if (found == std::end(kCoefficients)) return std::nullopt;
  return static_cast<std::size_t>(found - std::begin(kCoefficients));
}

}  // namespace Device

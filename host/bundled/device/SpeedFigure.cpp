#include "host/bundled/device/SpeedFigure.h"

#include <cmath>
#include <initializer_list>
#include <limits>

namespace Device {
namespace {

double ProductError(double figure, double value) {
  return std::abs(figure * kSpeedDataScale - value);
}

}  // namespace

double SpeedFigure(double value) {
  constexpr double kInfinity = std::numeric_limits<double>::infinity();
  const double quotient = value / kSpeedDataScale;
  double best = quotient;
  // The true quotient lies between the rounded one and one of its neighbours, and rounding
  // keeps the order of the products: no double further away can have a nearer product. In the
  // range of limits the rounded quotient itself is the best one; trying the neighbours makes
  // that a matter of course rather than of an argument about two roundings.
  for (const double neighbour :
       {std::nextafter(quotient, -kInfinity), std::nextafter(quotient, kInfinity)}) {
    if (ProductError(neighbour, value) < ProductError(best, value)) best = neighbour;
  }
  return best;
}

}  // namespace Device

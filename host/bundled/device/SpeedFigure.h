// The scaling of speed data.
//
// Users of the speed data multiply every figure by 1e9 and compare the product with round
// numbers: a limit of 1080 MHz must admit 1080 MHz. The figure is therefore chosen for its
// product. About one number in twenty is the product of no double, because the products of neighbouring
// doubles can lie almost two units in the last place apart. Those, with 15, 60 and 960 among
// them, come back one unit in the last place off, whatever is done here.
//
// Tested by speed_figure_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_SPEEDFIGURE_H_
#define VORKEL_HOST_BUNDLED_DEVICE_SPEEDFIGURE_H_

namespace Device {

// What users of the speed data multiply every figure by.
inline constexpr double kSpeedDataScale = 1e9;

// The double whose product with kSpeedDataScale is exactly `value`, a finite number in MHz or
// ns or a count; the one with the nearest product when no double has that product.
double SpeedFigure(double value);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_SPEEDFIGURE_H_

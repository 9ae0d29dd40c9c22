// The calculator's own numbering of KRU pins, which is not that of the KRU solvers.
//
// Tested by pin_code_test.cpp.
#ifndef VORKEL_ENGINE_TIMING_PINCODE_H_
#define VORKEL_ENGINE_TIMING_PINCODE_H_

#include "host/Port_StringBase.h"

namespace Ip {

// The code of a pin name. Any other text is 12, which the calculator answers for; 6 and 11 are
// no pin's.
int CalculatorPinCode(const Port::StringBase& pin);

}  // namespace Ip

#endif  // VORKEL_ENGINE_TIMING_PINCODE_H_

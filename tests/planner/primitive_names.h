// Primitives as test parameters are shown by name.
#ifndef VORKEL_TESTS_PLANNER_PRIMITIVE_NAMES_H_
#define VORKEL_TESTS_PLANNER_PRIMITIVE_NAMES_H_

#include <ostream>

#include "hardware/Primitive.h"

namespace hardware {

inline void PrintTo(Primitive primitive, std::ostream* stream) { *stream << Name(primitive); }

}  // namespace hardware

#endif  // VORKEL_TESTS_PLANNER_PRIMITIVE_NAMES_H_

// Names of what is generated: they must be legal in Verilog and in VHDL, so that the same name does
// for both.
//
// Tested by names.test.
#ifndef VORKEL_PLANNER_HDL_NAMES_H_
#define VORKEL_PLANNER_HDL_NAMES_H_

#include <string>
#include <string_view>

#include "hardware/Primitive.h"

namespace planner::hdl {

inline constexpr std::string_view kDefaultName = "clocks";
inline constexpr std::size_t kLongestName = 200;

// What the instance of a primitive is called: "tsyn_inst".
std::string LabelOf(hardware::Primitive primitive);

// Why a module or an entity cannot have a name, as the end of a sentence about it: "is a keyword of
// VHDL". Nothing when it can.
//
// A name has letters, digits and single underscores, begins with a letter and does not end with an
// underscore. It is no keyword of SystemVerilog (IEEE 1800-2017) or VHDL (IEEE 1076-2019), whatever
// its case, and no name that the generated text or the models need for something else.
std::string NameProblem(std::string_view name);

}  // namespace planner::hdl

#endif  // VORKEL_PLANNER_HDL_NAMES_H_

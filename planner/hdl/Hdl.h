// An answer in a hardware description language: a module that has the primitive in it, and a
// testbench for that module. Both are read with the models in hdl/.
//
// doc/hdl.md describes what is written. Tested by hdl.test.
#ifndef VORKEL_PLANNER_HDL_HDL_H_
#define VORKEL_PLANNER_HDL_HDL_H_

#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::hdl {

enum class Language { kVerilog, kVhdl };

// A module or an entity `name` with an instance of the primitive. Its ports are clk_in1, with two
// inputs clk_in2 and clk_in_sel, rst, clk_out0 and so on of the outputs that are used, and locked.
// The answer is solved, Refusal (Instance.h) says nothing of the request, and NameProblem (Names.h)
// nothing of the name.
std::string Module(Language language, const std::string& name, const Request& request,
                   const Device& device, const Answer& answer);

// A testbench `name`_tb for that module, which ends with a line PASS or FAIL, and with another exit
// status of the simulator when it fails. What it expects are the exact figures of the answer, not
// its settings.
std::string Testbench(Language language, const std::string& name, const Request& request,
                      const Device& device, const Answer& answer);

}  // namespace planner::hdl

#endif  // VORKEL_PLANNER_HDL_HDL_H_

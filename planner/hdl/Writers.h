// The two languages behind Hdl.h.
#ifndef VORKEL_PLANNER_HDL_WRITERS_H_
#define VORKEL_PLANNER_HDL_WRITERS_H_

#include <string>

#include "planner/hdl/Bench.h"
#include "planner/hdl/Instance.h"

namespace planner::hdl {

// Without the comment at the head.
std::string VerilogModule(const std::string& name, const Instance& instance);
std::string VhdlModule(const std::string& name, const Instance& instance);
std::string VerilogBench(const std::string& name, const Instance& instance, const Bench& bench);
std::string VhdlBench(const std::string& name, const Instance& instance, const Bench& bench);

}  // namespace planner::hdl

#endif  // VORKEL_PLANNER_HDL_WRITERS_H_

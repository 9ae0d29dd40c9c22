// What an answer is written as, beside the documents of the planner.
#ifndef VORKEL_PYTHON_WRITING_H_
#define VORKEL_PYTHON_WRITING_H_

#include <string>

#include "planner/Answer.h"
#include "python/Asked.h"

namespace python {

// `gap`: from which gap on data can cross between clocks, "0.5ns" or "20%"; empty: the usual. All
// throw Refused.
std::string Sdc(const Asked& asked, const planner::Answer& answer, bool plain, bool fifos,
                const std::string& gap);
// In JSON.
std::string Relations(const Asked& asked, const planner::Answer& answer, const std::string& gap);
// A module or its testbench.
std::string Hdl(const Asked& asked, const planner::Answer& answer, bool is_vhdl, bool is_testbench,
                const std::string& name);

}  // namespace python

#endif  // VORKEL_PYTHON_WRITING_H_

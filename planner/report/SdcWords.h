// What the forms of constraints share: names, numbers and comments.
#ifndef VORKEL_PLANNER_REPORT_SDCWORDS_H_
#define VORKEL_PLANNER_REPORT_SDCWORDS_H_

#include <cstddef>
#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::report {

// A number as exactly as a double has it, and one for a reader.
std::string SdcExact(const Rational& value);
std::string SdcFigure(const Rational& value);

// Lines of comment.
std::string SdcComment(const std::string& sentence);

// The first lines: the settings; and what is off, where something is.
std::string SdcSettings(const Request& request, const Device& device, const Answer& answer);
// That clocks are as fast as the tolerance of the inputs lets them be; empty without a tolerance.
std::string SdcTolerance(const Request& request);
std::string SdcOff(const Device& device, const Answer& answer);

// What the primitive is called in the design, where nobody says anything else, and its pin of an
// output.
std::string SdcInstance(const Answer& answer);
std::string SdcPin(const Answer& answer, std::size_t index);

// "clk_out0", or "{clk_out0 clk_out1}", in the brackets of the command.
std::string SdcClocks(const std::vector<std::string>& names);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_SDCWORDS_H_

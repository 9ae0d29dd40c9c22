// Demands and changes of an explanation in words, as they stand in its sentences.
//
// Tested by explain_text_test.cpp.
#ifndef VORKEL_PLANNER_REPORT_EXPLAINWORDS_H_
#define VORKEL_PLANNER_REPORT_EXPLAINWORDS_H_

#include <string>
#include <vector>

#include "planner/Device.h"
#include "planner/explain/Explain.h"

namespace planner::report {

// "output 0 at 333 MHz", "the VCO from 600 to 1440 MHz", "M up to 64".
std::string DemandWords(const explain::Demand& demand, const Request& request, const Device& device,
                        Primitive primitive);

// A change as what would be asked for: "output 1 at 112.5 degrees", "a VCO of 1450 MHz, 10 above
// the range", "output 0 with a tolerance of 84 ppm". A number that has to be allowed is rounded up,
// so that what is written works when it is given to the program.
std::string ChangeWords(const explain::Change& change, Primitive primitive);

// A frequency as it can be given to the program, exactly.
std::string FrequencyWords(const Rational& frequency);

// With so many decimals, rounded up.
std::string RoundedUp(const Rational& value, int decimals);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_EXPLAINWORDS_H_

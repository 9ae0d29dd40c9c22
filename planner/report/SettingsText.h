// The settings of an answer as labels and values.
#ifndef VORKEL_PLANNER_REPORT_SETTINGSTEXT_H_
#define VORKEL_PLANNER_REPORT_SETTINGSTEXT_H_

#include <cstddef>
#include <optional>
#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/report/Table.h"

namespace planner::report {

// What stands above the tables of a report.
Pairs SettingsPairs(const Request& request, const Device& device, const Answer& answer);

// Whether the jitter of some output is known.
bool HasJitter(const Answer& answer);

// Which output of the request stands at a place of an answer: another one than that place where
// outputs were allowed to change places and have done so.
int RequestIndex(const Request& request, const Answer& answer, int place);
const Output& RequestedAt(const Request& request, const Answer& answer, int place);

// Where an output is: its divider, or its pin.
std::string Place(const Settings& settings, int output);

// The range of an output: of a KRU that of its pin, which depends on where output 0 is.
Range OutputRange(const Device& device, const Settings& settings, std::size_t index);

// Settings in one line: "M 44, D 1 and dividers 8, 16 and 44".
std::string SettingsWords(const Settings& settings);

// The phase, degrees, that PHASE_SHIFT of a KRU_SP is to make: what the request asks for beyond
// the phase of the pin, of the first output that asks for one. 0 without a PHASE_SHIFT.
Rational PhaseOffset(const Request& request, const Answer& answer);

// Whether the engine has counted with a VCO that can be told from that of the settings.
bool IsVcoOff(const Answer& answer);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_SETTINGSTEXT_H_

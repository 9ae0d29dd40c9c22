// A call of a command that takes a request: options, request file and device, read and checked.
//
// Tested by wrong.test and request_file.test.
#ifndef VORKEL_CLI_CALL_H_
#define VORKEL_CLI_CALL_H_

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"
#include "cli/Words.h"
#include "planner/Device.h"
#include "planner/read/Draft.h"
#include "planner/report/Sdc.h"
#include "planner/report/Style.h"

namespace cli {

enum class Format { kText, kJson, kTcl, kSdc, kVerilog, kVhdl, kTestbench };

// Whether a format is one for a design or its simulation, see Hdl.h.
constexpr bool IsHdl(Format format) {
  return format == Format::kVerilog || format == Format::kVhdl || format == Format::kTestbench;
}

struct Call {
  std::string_view command;
  Given given;
  planner::read::Reading reading;
  planner::Device device;
  Format format = Format::kText;
  planner::report::SdcOptions sdc;            // of the format kSdc, and the rule of relations
  std::string file;                           // of -o; empty: standard output
  std::vector<planner::read::Option> pasted;  // options that ask the same once more

  const planner::Request& request() const { return reading.request; }
};

// Reads the words of a command; with a primitive, of that which asks it alone. Throws Failure, for
// all that is wrong at once.
Call ReadCall(std::string_view command, const std::vector<std::string>& words,
              std::optional<planner::Primitive> primitive, const Setting& setting);

// How a command that has more to read makes its request of what options and --request say. What is
// wrong is added to the mistakes, and there is nothing then.
using MakeReading = std::function<std::optional<planner::read::Reading>(
    const Given& given, const planner::read::Draft& draft, planner::read::Mistakes* mistakes)>;
// The same for such a command, with at most so many words that are no options.
Call ReadCall(std::string_view command, const std::vector<std::string>& words,
              std::size_t most_operands, const MakeReading& make, const Setting& setting);

// Throws what is wrong with the words of a command as Failure.
[[noreturn]] void Refuse(const planner::read::Mistakes& mistakes);

// The value of an option that is a whole number from `lowest` to `highest`, nothing when it was not
// given. Throws Failure.
std::optional<int> WholeNumber(const Given& given, std::string_view name, int lowest, int highest);

// How the text of a call looks where it goes.
planner::report::Style StyleOf(const Call& call, const Setting& setting);

// A call of another command about the same, as it can be pasted into a shell.
std::string PastedCall(std::string_view command, const Call& call, const Setting& setting);
// A command with some options, likewise.
std::string PastedCall(std::string_view command, const std::vector<planner::read::Option>& options,
                       const Setting& setting);

// Writes what a call has to say, in its format. What may not have been meant is told first, before
// a text, and else on standard error.
void Write(const Call& call, const std::string& text, const Setting& setting);
// That itself, lines for the beginning of a text; mostly nothing.
std::string DoubtLines(const Call& call, const planner::report::Style& style);

}  // namespace cli

#endif  // VORKEL_CLI_CALL_H_

// What holds for requests, however they are written.
#ifndef VORKEL_FUZZ_REQUESTS_H_
#define VORKEL_FUZZ_REQUESTS_H_

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "fuzz/Fuzz.h"
#include "planner/read/Draft.h"
#include "planner/read/MistakeText.h"
#include "planner/read/Options.h"

namespace fuzz {

inline void RequireWords(const planner::read::Mistakes& mistakes) {
  for (const planner::read::Mistake& mistake : mistakes) {
    Require(!TextOf(mistake).empty(), "a mistake without a word");
  }
}

// Options in one line.
inline std::string Text(const std::vector<planner::read::Option>& options) {
  std::string text;
  for (const planner::read::Option& option : options) {
    text += option.name + " " + option.value + "\n";
  }
  return text;
}

// A request that says the same by the demands of its used outputs alone: those of all outputs count
// where an output has none, and nothing counts of outputs that are not used.
inline planner::Request ByOutputs(planner::Request request) {
  for (planner::Output& output : request.outputs) {
    if (output.used) {
      output.tolerance = request.ToleranceOf(output);
      output.phase_tolerance = request.PhaseToleranceOf(output);
      output.duty_tolerance = request.DutyToleranceOf(output);
      output.max_jitter = request.MaxJitterOf(output);
    } else {
      output = {};
      output.used = false;
    }
  }
  const planner::Request usual;
  request.tolerance = usual.tolerance;
  request.phase_tolerance = usual.phase_tolerance;
  request.duty_tolerance = usual.duty_tolerance;
  request.max_jitter = usual.max_jitter;
  return request;
}

// Finishes a draft that `mistakes` were made in. A request that comes of it says the same when it is
// said by options.
inline void FinishDraft(const planner::read::Draft& draft, planner::read::Mistakes mistakes) {
  using namespace planner::read;
  RequireWords(mistakes);
  if (!mistakes.empty()) return;
  const std::optional<Reading> reading = Finish(draft, {}, &mistakes);
  RequireWords(mistakes);
  Require(reading.has_value() == mistakes.empty(), "a request with mistakes, or none without");
  if (!reading) return;
  const std::vector<Option> options = OptionsOf(reading->request);
  const Draft again = ReadOptions(options, &mistakes);
  const std::optional<Reading> same = Finish(again, {}, &mistakes);
  Require(same.has_value(), mistakes.empty() ? "no request" : TextOf(mistakes.front()));
  const std::string said = Text(OptionsOf(ByOutputs(reading->request)));
  const std::string read = Text(OptionsOf(ByOutputs(same->request)));
  Require(read == said, "another request:\n" + said + "is read as\n" + read);
}

// Reads a request with the reader of its format.
using Reader = planner::read::Draft (*)(std::string_view text, std::string_view file,
                                        planner::read::Mistakes* mistakes);
inline int ReadRequest(Reader reader, std::string_view text) {
  planner::read::Mistakes mistakes;
  const planner::read::Draft draft = reader(text, "request", &mistakes);
  FinishDraft(draft, std::move(mistakes));
  return 0;
}

}  // namespace fuzz

#endif  // VORKEL_FUZZ_REQUESTS_H_

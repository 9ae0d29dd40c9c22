#include "cli/ReachCommand.h"

#include <fmt/format.h>

#include <algorithm>
#include <optional>
#include <utility>

#include "cli/Call.h"
#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/Output.h"
#include "cli/Stream.h"
#include "cli/Words.h"
#include "planner/reach/Reach.h"
#include "planner/read/Letters.h"
#include "planner/read/Options.h"
#include "planner/read/Shown.h"
#include "planner/read/Units.h"
#include "planner/report/FindingText.h"
#include "planner/report/ReachText.h"
#include "planner/report/Table.h"

namespace cli {

namespace {

using planner::Primitive;
using planner::Rational;
using planner::read::Option;
using planner::report::ReachForm;
using planner::report::ReachQuestion;

constexpr int kMostOutput = hardware::MostOutputs(Primitive::kPll) - 1;
constexpr int kMostShown = 999'999'999;
constexpr int kMostFound = 100'000;  // gaps, and nearest ones: these are kept
constexpr int kUsualNear = 5;
constexpr int kUsualInText = 40;

std::optional<Rational> Frequency(const Given& given, const std::string& name) {
  const std::optional<std::string> text = given.Value(name);
  if (!text) return std::nullopt;
  planner::read::Mistakes mistakes;
  planner::read::Place place;
  place.entry = name;
  auto value =
      planner::read::ReadValue(*text, planner::read::ValueKind::kFrequency, place, &mistakes);
  if (!value) Refuse(mistakes);
  return value;
}

// The form of --format; nothing for Tcl.
std::optional<ReachForm> ReadForm(const Given& given) {
  const std::string name = given.Value("--format").value_or("text");
  const auto is = [&](std::string_view word) { return planner::read::IsSameWord(word, name); };
  if (is("text")) return ReachForm::kText;
  if (is("json")) return ReachForm::kJson;
  if (is("csv")) return ReachForm::kCsv;
  if (is("tcl")) return std::nullopt;
  throw Failure::OfUsage(
      fmt::format("--format: \"{}\" must be text, json, csv or tcl", planner::read::Shown(name)));
}

ReachQuestion ReadQuestion(const Given& given, const std::optional<ReachForm>& form) {
  ReachQuestion question;
  question.output = WholeNumber(given, "--output", 0, kMostOutput).value_or(0);
  question.from = Frequency(given, "--from");
  question.to = Frequency(given, "--to");
  if (question.from && question.to && *question.to < *question.from) {
    throw Failure::OfUsage("--to is below --from");
  }
  std::vector<std::string> kinds;
  for (const char* const name : {"--near", "--gaps", "--count"}) {
    if (given.Has(name)) kinds.emplace_back(name);
  }
  if (kinds.size() > 1) {
    throw Failure::OfUsage(
        fmt::format("{} and {} are two questions; ask one after the other", kinds[0], kinds[1]));
  }
  if (given.Has("--most") && (given.Has("--gaps") || given.Has("--count"))) {
    throw Failure::OfUsage(fmt::format("--most has no use beside {}", kinds[0]));
  }
  if (const auto near = Frequency(given, "--near")) {
    question.kind = ReachQuestion::Kind::kNear;
    question.near = *near;
    question.most = WholeNumber(given, "--most", 1, kMostFound).value_or(kUsualNear);
  } else if (const auto gaps = WholeNumber(given, "--gaps", 1, kMostFound)) {
    question.kind = ReachQuestion::Kind::kGaps;
    question.most = *gaps;
  } else if (given.Has("--count")) {
    question.kind = ReachQuestion::Kind::kCount;
  } else {
    question.most = WholeNumber(given, "--most", 0, kMostShown)
                        .value_or(form == ReachForm::kText ? kUsualInText : 0);
  }
  return question;
}

// The request: an output at its place, with a frequency that does not count.
planner::read::Reading ReadRequest(const Given& given, int output) {
  std::vector<Option> options;
  for (const Option& option : given.options) {
    if (planner::read::FindOption(option.name)) options.push_back(option);
  }
  std::string outputs;
  for (int i = 0; i < output; ++i) outputs += "-,";
  options.push_back({"--out", outputs + "100"});
  planner::read::Mistakes mistakes;
  const planner::read::Draft draft = planner::read::ReadOptions(options, &mistakes);
  std::optional<planner::read::Reading> reading = Finish(draft, {}, &mistakes);
  if (!mistakes.empty()) Refuse(mistakes);
  return std::move(*reading);
}

// Those that can be asked.
std::vector<Primitive> PrimitivesOf(const planner::Request& request,
                                    const planner::Device& device) {
  planner::reach::Askable askable = planner::reach::AskableOf(request, device);
  if (!askable.primitives.empty()) return std::move(askable.primitives);
  std::string reasons;
  for (const planner::Answer& answer : askable.refused) {
    for (const planner::Finding& refusal : answer.refusals) {
      reasons += fmt::format("vorkel: {}\n", planner::report::FindingText(refusal, device));
    }
  }
  throw Failure(kUnsolved, reasons);
}

}  // namespace

int RunReach(std::string_view command, const std::vector<std::string>& words,
             const Setting& setting) {
  const Given given = ReadWords(command, words);
  const std::optional<ReachForm> form = ReadForm(given);
  const ReachQuestion question = ReadQuestion(given, form);
  const std::string file = given.Value("-o").value_or("");
  if (file.empty() && given.Has("-o")) {
    throw Failure::OfUsage("-o: the name of the file is empty");
  }
  const planner::read::Reading reading = ReadRequest(given, question.output);
  const planner::Request& request = reading.request;
  const planner::Device device = FindDevice(reading, setting);
  const std::vector<Primitive> primitives = PrimitivesOf(request, device);
  Stream stream(file, Stream::Draft::kDropped);
  std::int64_t found = 0;
  if (form) {
    found = WriteReach(request, device, question, primitives, *form,
                       [&](const std::string& text) { return stream.Write(text); });
  } else {
    std::string dict;
    found = WriteReachTcl(request, device, question, primitives, &dict);
    stream.Write(dict);
  }
  if (found == 0 && question.kind != ReachQuestion::Kind::kCount) {
    throw Failure(kUnsolved, planner::report::Prose(
                                 {false, setting.err_width},
                                 "vorkel: ", NothingInReachText(question, device, primitives)));
  }
  stream.Finish();
  return kDone;
}

}  // namespace cli

#include "cli/RequestFile.h"

#include <fmt/format.h>

#include "cli/Failure.h"
#include "cli/InputFile.h"
#include "cli/TclRequest.h"
#include "planner/read/Form.h"
#include "planner/read/RequestJson.h"
#include "planner/read/RequestTcl.h"
#include "planner/read/RequestToml.h"
#include "planner/read/Shown.h"

namespace cli {

namespace {

// No request is larger, in bytes.
constexpr std::size_t kLargest = 100'000;

std::string Contents(const std::string& name) {
  if (name.empty()) throw Failure::OfUsage("--request: the name of the file is empty");
  const std::string shown = planner::read::Shown(name);
  std::string text;
  try {
    text = ReadFile(name, kLargest);
  } catch (const FileError& error) {
    throw Failure::OfUsage(fmt::format("--request: {} cannot be read: {}", shown, error.what()));
  }
  if (text.size() > kLargest) {
    throw Failure::OfUsage(fmt::format("--request: {} is too large for a request", shown));
  }
  return text;
}

}  // namespace

planner::read::Draft ReadRequestFile(const std::string& name, const Setting& setting,
                                     planner::read::Mistakes* mistakes) {
  const std::string text = Contents(name);
  switch (planner::read::FormOf(name, text)) {
    case planner::read::Form::kJson:
      return planner::read::ReadJson(text, name, mistakes);
    case planner::read::Form::kToml:
      return planner::read::ReadToml(text, name, mistakes);
    case planner::read::Form::kTcl:
      break;
  }
  return planner::read::ReadTclAnswer(AskTcl(text, setting), name, mistakes);
}

}  // namespace cli

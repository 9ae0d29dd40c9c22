#include "cli/RequestFile.h"

#include "cli/InputFile.h"
#include "cli/TclRequest.h"
#include "planner/read/Form.h"
#include "planner/read/RequestJson.h"
#include "planner/read/RequestTcl.h"
#include "planner/read/RequestToml.h"

namespace cli {

namespace {

// No request is larger, in bytes.
constexpr std::size_t kLargest = 100'000;

}  // namespace

planner::read::Draft ReadRequestFile(const std::string& name, const Setting& setting,
                                     planner::read::Mistakes* mistakes) {
  const std::string text = ReadFileOf("request", name, kLargest, "--request");
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

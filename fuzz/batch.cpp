// Lines of a batch, on a small device: each is answered by a plan, or by what is wrong with it.

#include "fuzz/Fuzz.h"
#include "planner/batch/Answerer.h"
#include "planner/batch/Resumed.h"
#include "tests/planner/device/memory_files.h"

namespace {

using planner::batch::Outcome;
using planner::batch::Status;

// As the program keeps of a line.
constexpr std::size_t kLongestLine = 2000;

// A PLL whose VCO and PFD have one frequency each, 800 and 100 MHz: its plans are made quickly.
const MemoryFiles& Files() {
  static const MemoryFiles files = [] {
    MemoryFiles made;
    made.texts["small"] =
        "device = \"small\"\npackages = [\"p\"]\ndefault_grade = \"1\"\n[grade.1]\n"
        "VCOCLK_FREQ_MIN = 800\nVCOCLK_FREQ_MAX = 800\nCLKOUT_FREQ_MIN_GCLK = 10\n"
        "CLKOUT_FREQ_MAX_GCLK = 400\nCLKOUT_FREQ_MAX_IOCLK = 800\nCLKPFD_FREQ_MIN = 100\n"
        "CLKPFD_FREQ_MAX = 100\nO_MAX_HT_LT = 64\n";
    return made;
  }();
  return files;
}

void Hold(const Outcome& outcome, const planner::batch::Line& line) {
  fuzz::Require(outcome.line == line.number && outcome.digest == line.digest, "another line");
  fuzz::Require(outcome.status != Status::kFailed, outcome.failure);
  const bool is_wrong = !outcome.mistakes.empty() || outcome.part.has_value() ||
                        outcome.trouble != planner::batch::Trouble::kNone;
  fuzz::Require(is_wrong == (outcome.status == Status::kWrong), "wrong without a reason, or right");
  fuzz::Require(is_wrong != outcome.plan.has_value(), "a plan of what is wrong, or none");
  const planner::batch::Head head{outcome.line, outcome.digest, outcome.status, outcome.Best()};
  const std::string text = TextOf(head);
  fuzz::Require(text.size() <= planner::batch::kMostOfHead, "a long head");
  fuzz::Require(planner::batch::ReadHead(text + ",\"id\":null}") == head,
                "the head is not read back: " + text);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  planner::batch::Answerer answerer({"batch.jsonl", {}, "small"}, Files());
  const auto take = [&](const planner::batch::Line& line) {
    // Outputs in any order are thousands of plans.
    if (line.text.find("any_order") != std::string::npos) return;
    Hold(answerer.Answer(line), line);
  };
  const std::string_view text = fuzz::TextOf(data, size);
  planner::batch::ReadHead(text);
  // In two pieces, as from a pipe.
  planner::batch::Lines lines(kLongestLine);
  lines.Add(text.substr(0, size / 2), take);
  lines.Add(text.substr(size / 2), take);
  lines.End(take);
  return 0;
}

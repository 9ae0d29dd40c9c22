#include "cli/Hdl.h"

#include <fmt/format.h>

#include "cli/Failure.h"
#include "planner/hdl/Hdl.h"
#include "planner/hdl/Instance.h"
#include "planner/hdl/Names.h"
#include "planner/read/Letters.h"
#include "planner/read/Shown.h"

namespace cli {

namespace {

using planner::hdl::Language;
using planner::read::IsSameWord;
using planner::read::Shown;

std::string NameOf(const Call& call) {
  return call.given.Value("--name").value_or(std::string(planner::hdl::kDefaultName));
}

Language LanguageOf(const Call& call) {
  const bool is_vhdl = call.format == Format::kVhdl ||
                       IsSameWord(call.given.Value("--language").value_or(""), "vhdl");
  return is_vhdl ? Language::kVhdl : Language::kVerilog;
}

}  // namespace

std::vector<std::string> HdlMistakes(const Call& call) {
  std::vector<std::string> mistakes;
  if (const auto name = call.given.Value("--name")) {
    const std::string problem = planner::hdl::NameProblem(*name);
    if (!IsHdl(call.format)) {
      mistakes.emplace_back("--name goes with --format verilog, vhdl or testbench only");
    } else if (!problem.empty()) {
      mistakes.push_back(fmt::format("--name: \"{}\" {}", Shown(*name), problem));
    }
  }
  if (const auto language = call.given.Value("--language")) {
    if (call.format != Format::kTestbench) {
      mistakes.emplace_back("--language goes with --format testbench only");
    } else if (!IsSameWord(*language, "verilog") && !IsSameWord(*language, "vhdl")) {
      mistakes.push_back(
          fmt::format("--language: \"{}\" must be verilog or vhdl", Shown(*language)));
    }
  }
  return mistakes;
}

std::string HdlText(const Call& call, const planner::Answer& answer) {
  const std::string refusal = planner::hdl::Refusal(call.request());
  if (!refusal.empty()) throw Failure::OfUsage(fmt::format("--format: {}", refusal));
  const auto& write =
      call.format == Format::kTestbench ? planner::hdl::Testbench : planner::hdl::Module;
  return write(LanguageOf(call), NameOf(call), call.request(), call.device, answer);
}

}  // namespace cli

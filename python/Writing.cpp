// Tested by tests/python/test_plan.py.
#include "python/Writing.h"

#include "planner/hdl/Hdl.h"
#include "planner/hdl/Instance.h"
#include "planner/hdl/Names.h"
#include "planner/read/Shown.h"
#include "planner/relations/Rule.h"
#include "planner/report/Relations.h"
#include "planner/report/Sdc.h"
#include "python/Refused.h"

namespace python {

namespace {

planner::relations::Rule Rule(const std::string& text) {
  if (text.empty()) return {};
  planner::read::Mistakes mistakes;
  planner::read::Place place;
  place.entry = "gap";
  const auto rule = planner::relations::ReadRule(text, place, &mistakes);
  if (!rule) RefuseMistakes(mistakes);
  return *rule;
}

}  // namespace

std::string Sdc(const Asked& asked, const planner::Answer& answer, bool plain, bool fifos,
                const std::string& gap) {
  planner::report::SdcOptions options;
  options.plain = plain;
  options.fifos = fifos;
  options.rule = Rule(gap);
  return planner::report::Sdc(asked.request(), asked.device, answer, options);
}

std::string Relations(const Asked& asked, const planner::Answer& answer, const std::string& gap) {
  return planner::report::RelationsJson(asked.request(), asked.device, answer, Rule(gap));
}

std::string Hdl(const Asked& asked, const planner::Answer& answer, bool is_vhdl, bool is_testbench,
                const std::string& name) {
  const std::string shown = planner::read::Shown(name);
  std::string wrong = planner::hdl::NameProblem(name);
  if (!wrong.empty()) wrong = "\"" + shown + "\" " + wrong;
  if (wrong.empty()) wrong = planner::hdl::Refusal(asked.request());
  if (!wrong.empty()) RefuseEntry("not_writable", "name", shown, wrong);
  const auto language = is_vhdl ? planner::hdl::Language::kVhdl : planner::hdl::Language::kVerilog;
  const auto& write = is_testbench ? planner::hdl::Testbench : planner::hdl::Module;
  return write(language, name, asked.request(), asked.device, answer);
}

}  // namespace python

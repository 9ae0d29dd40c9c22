// Tested by hdl.test.
#include "planner/hdl/Hdl.h"

#include "planner/hdl/Bench.h"
#include "planner/hdl/Head.h"
#include "planner/hdl/Instance.h"
#include "planner/hdl/Writers.h"

namespace planner::hdl {

namespace {

std::string_view MarkOf(Language language) { return language == Language::kVerilog ? "//" : "--"; }

std::string Subject(const Device& device, const Answer& answer) {
  return std::string(Name(answer.primitive)) + " of a " + device.part;
}

}  // namespace

std::string Module(Language language, const std::string& name, const Request& request,
                   const Device& device, const Answer& answer) {
  const Instance instance = InstanceOf(request, device, answer);
  return Head(MarkOf(language), "Clocks from a " + Subject(device, answer) + ".", request, device,
              answer) +
         (language == Language::kVerilog ? VerilogModule(name, instance)
                                         : VhdlModule(name, instance));
}

std::string Testbench(Language language, const std::string& name, const Request& request,
                      const Device& device, const Answer& answer) {
  const Instance instance = InstanceOf(request, device, answer);
  const Bench bench = BenchOf(request, answer);
  return Head(MarkOf(language),
              "Testbench of " + name + ", clocks from a " + Subject(device, answer) + ". " +
                  BenchText(bench),
              request, device, answer) +
         (language == Language::kVerilog ? VerilogBench(name, instance, bench)
                                         : VhdlBench(name, instance, bench));
}

}  // namespace planner::hdl

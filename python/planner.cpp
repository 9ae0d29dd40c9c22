// The extension vorkel._planner: the planner's library for the Python package that stands around
// it.
//
// What goes in is a request in JSON, and what comes out JSON and other texts; the package makes
// types of them. What goes wrong is raised by the package's own functions (vorkel/_errors.py),
// which get it as data.
//
// Python's other threads run while something is planned, and can plan themselves: plans share
// nothing, and runs of the engine take turns (planner/engine/Ask.h).
//
// Tested by tests/python.
#include <pybind11/pybind11.h>

#include <cstddef>
#include <memory>
#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/bundled/device/Shipped.h"
#include "planner/device/Catalogue.h"
#include "planner/device/Check.h"
#include "planner/device/Files.h"
#include "planner/explain/Explain.h"
#include "planner/hdl/Hdl.h"
#include "planner/hdl/Instance.h"
#include "planner/hdl/Names.h"
#include "planner/plan/Plan.h"
#include "planner/read/RequestJson.h"
#include "planner/read/Shown.h"
#include "planner/relations/Rule.h"
#include "planner/report/DevicesText.h"
#include "planner/report/ErrorData.h"
#include "planner/report/ExplainText.h"
#include "planner/report/Json.h"
#include "planner/report/PartText.h"
#include "planner/report/PlanText.h"
#include "planner/report/Relations.h"
#include "planner/report/Sdc.h"
#include "planner/report/VerifyText.h"
#include "planner/verify/Verify.h"

namespace {

namespace py = pybind11;
using nlohmann::ordered_json;
using std::string;

constexpr const char* kUsualDevice = "vk40";

string Text(const ordered_json& data) {
  return data.dump(-1, ' ', false, ordered_json::error_handler_t::replace);
}

// Raises what a function of vorkel._errors makes of the data.
[[noreturn]] void Raise(const char* function, const ordered_json& data) {
  py::module_::import("vorkel._errors").attr(function)(py::str(Text(data)));
  throw py::error_already_set();  // the function has raised
}

[[noreturn]] void RaiseMistakes(const planner::read::Mistakes& mistakes) {
  ordered_json data = ordered_json::array();
  for (const auto& mistake : mistakes) data.push_back(planner::report::MistakeData(mistake));
  Raise("raise_request", data);
}

[[noreturn]] void RaisePart(const planner::device::PartError& error) {
  Raise("raise_request", ordered_json::array({planner::report::PartErrorData(error)}));
}

[[noreturn]] void RaiseUnsolved(const planner::plan::Plan& plan, const planner::Device& device) {
  ordered_json data = ordered_json::array();
  for (const auto& answer : plan.refused) {
    data.push_back(planner::report::RefusedData(answer, device));
  }
  Raise("raise_unsolved", data);
}

// Does something that knows no Python, while that goes on.
template <typename Work>
auto Beside(const Work& work) {
  const py::gil_scoped_release released;
  return work();
}

// A request and the device that it is for.
struct Asked {
  planner::read::Reading reading;
  planner::Device device;
  const planner::Request& request() const { return reading.request; }
};

ordered_json NoPrimitive(const planner::Device& device, const string& message) {
  return ordered_json::array({{{"kind", "no_primitive"},
                               {"entry", "device"},
                               {"text", device.part},
                               {"known", ordered_json::array()},
                               {"message", message}}});
}

Asked Read(const string& json) {
  planner::read::Mistakes mistakes;
  const planner::read::Draft draft = planner::read::ReadJson(json, "", &mistakes);
  if (!mistakes.empty()) RaiseMistakes(mistakes);
  auto reading = planner::read::Finish(draft, {}, &mistakes);
  if (!reading) RaiseMistakes(mistakes);
  Asked asked;
  asked.reading = std::move(*reading);
  try {
    const auto files = planner::device::HostFiles();
    const auto& name = asked.reading.device;
    asked.device = planner::device::Catalogue(*files).FindDevice(name ? name->value : kUsualDevice);
  } catch (const planner::device::PartError& error) {
    RaisePart(error);
  }
  const auto& primitive = asked.request().primitive;
  if (asked.device.primitives.empty()) {
    Raise("raise_request", NoPrimitive(asked.device, planner::report::LacksAllText(asked.device)));
  }
  if (primitive && !asked.device.Has(*primitive)) {
    Raise("raise_request",
          NoPrimitive(asked.device, planner::report::LacksText(asked.device, *primitive)));
  }
  return asked;
}

// What a plan is shown as.
enum class Part { kPlan, kCompare, kBest };

class Plan {
 public:
  explicit Plan(const string& request) : asked_(Read(request)) {
    plan_ = Beside([this] { return planner::plan::Make(asked_.request(), asked_.device); });
    if (!plan_.IsSolved()) RaiseUnsolved(plan_, asked_.device);
  }

  std::size_t Count() const { return plan_.ranked.size(); }
  string Json(Part part, std::size_t number, std::size_t most) const {
    return planner::report::Json(asked_.request(), asked_.device, Entries(part, number, most),
                                 plan_.front_cut);
  }
  string Tcl(Part part, std::size_t number, std::size_t most) const {
    return planner::report::Tcl(asked_.request(), asked_.device, Entries(part, number, most),
                                plan_.front_cut);
  }
  string Report(Part part, std::size_t number, std::size_t most, int width) const {
    const planner::report::Style style{false, width};
    switch (part) {
      case Part::kCompare:
        return planner::report::CompareText(plan_, asked_.device, style, {});
      case Part::kBest:
        return planner::report::BestText(plan_, asked_.device, Checked(number), most, style, {});
      case Part::kPlan:
        break;
    }
    return planner::report::PlanText(plan_, asked_.device, Checked(number), style, {});
  }
  string Sdc(std::size_t number, bool plain, bool fifos, const string& rule) const {
    planner::report::SdcOptions options;
    options.plain = plain;
    options.fifos = fifos;
    options.rule = Rule(rule);
    return planner::report::Sdc(asked_.request(), asked_.device, Candidate(number), options);
  }
  string Relations(std::size_t number, const string& rule) const {
    return planner::report::RelationsJson(asked_.request(), asked_.device, Candidate(number),
                                          Rule(rule));
  }
  string Hdl(std::size_t number, bool is_vhdl, bool is_testbench, const string& name) const {
    string wrong = planner::hdl::NameProblem(name);
    if (!wrong.empty()) wrong = "\"" + planner::read::Shown(name) + "\" " + wrong;
    if (wrong.empty()) wrong = planner::hdl::Refusal(asked_.request());
    if (!wrong.empty()) {
      Raise("raise_request", ordered_json::array({{{"kind", "not_writable"},
                                                   {"entry", "name"},
                                                   {"text", planner::read::Shown(name)},
                                                   {"known", ordered_json::array()},
                                                   {"message", wrong}}}));
    }
    const auto language =
        is_vhdl ? planner::hdl::Language::kVhdl : planner::hdl::Language::kVerilog;
    const auto& write = is_testbench ? planner::hdl::Testbench : planner::hdl::Module;
    return write(language, name, asked_.request(), asked_.device, Candidate(number));
  }

 private:
  // From which gap on data can cross between clocks: "0.5ns", "20%"; empty: the usual.
  static planner::relations::Rule Rule(const string& text) {
    if (text.empty()) return {};
    planner::read::Mistakes mistakes;
    planner::read::Place place;
    place.entry = "gap";
    const auto rule = planner::relations::ReadRule(text, place, &mistakes);
    if (!rule) RaiseMistakes(mistakes);
    return *rule;
  }
  std::size_t Checked(std::size_t number) const {
    if (plan_.Pick(number) == nullptr) throw py::index_error("there is no such candidate");
    return number;
  }
  const planner::Answer& Candidate(std::size_t number) const {
    return *plan_.Pick(Checked(number));
  }
  std::vector<planner::report::Entry> Entries(Part part, std::size_t number,
                                              std::size_t most) const {
    switch (part) {
      case Part::kCompare:
        return planner::report::CompareEntries(plan_);
      case Part::kBest:
        return planner::report::BestEntries(plan_, Checked(number), most);
      case Part::kPlan:
        break;
    }
    return planner::report::PlanEntries(plan_, Checked(number));
  }

  Asked asked_;
  planner::plan::Plan plan_;
};

class Explanation {
 public:
  Explanation(const string& request, const std::optional<string>& oscillators)
      : asked_(Read(request)), has_own_inputs_(oscillators) {
    const std::vector<planner::Rational> inputs =
        oscillators ? Inputs(*oscillators) : planner::explain::StockOscillators();
    explanation_ =
        Beside([&] { return planner::explain::Explain(asked_.request(), asked_.device, inputs); });
  }

  string Json() const { return planner::report::ExplainJson(explanation_, asked_.device); }
  string Report(int width) const {
    return planner::report::ExplainText(explanation_, asked_.device, {false, width}, {},
                                        has_own_inputs_);
  }

 private:
  // A list of frequencies in JSON.
  static std::vector<planner::Rational> Inputs(const string& json) {
    planner::read::Mistakes mistakes;
    std::vector<planner::Rational> inputs;
    planner::read::Place place;
    place.entry = "oscillators";
    for (const ordered_json& text : ordered_json::parse(json)) {
      ++place.index;
      const auto value = planner::read::ReadValue(
          text.get<string>(), planner::read::ValueKind::kFrequency, place, &mistakes);
      if (value) inputs.push_back(*value);
    }
    if (!mistakes.empty()) RaiseMistakes(mistakes);
    return inputs;
  }

  Asked asked_;
  bool has_own_inputs_;
  planner::explain::Explanation explanation_;
};

string Devices(const std::optional<string>& name) {
  const auto files = planner::device::HostFiles();
  if (!name) return planner::report::DevicesJson(planner::device::List(*files));
  try {
    const auto selection = planner::device::Catalogue(*files).Select(*name);
    return planner::report::DeviceJson(planner::device::Describe(selection.file), selection.grades);
  } catch (const planner::device::PartError& error) {
    RaisePart(error);
  }
}

string Check(const py::bytes& text, const string& file, const string& device) {
  return Text(planner::report::CheckData(planner::device::Check(string(text), file, device), file));
}

string Verify(const string& plan, const string& file) {
  planner::Device device;
  if (const auto part = planner::verify::PartOf(plan)) {
    const auto files = planner::device::HostFiles();
    try {
      device = planner::device::Catalogue(*files).FindDevice(*part);
    } catch (const planner::device::PartError& error) {
      RaisePart(error);
    }
  }
  const auto wrong = Beside(
      [&] { return planner::verify::Verify(plan, device, &planner::report::JsonSentences()); });
  ordered_json data = ordered_json::array();
  for (const auto& one : wrong) data.push_back(planner::report::DiscrepancyData(one, file));
  return Text(data);
}

}  // namespace

PYBIND11_MODULE(_planner, module) {
  module.doc() = "The planner of vorkel. Use the package vorkel, which has types for all of it.";
  module.attr("version") = VORKEL_VERSION;

  py::enum_<Part>(module, "Part", "What a plan is shown as.")
      .value("PLAN", Part::kPlan)
      .value("COMPARE", Part::kCompare)
      .value("BEST", Part::kBest);

  using py::arg;
  py::class_<Plan>(module, "Plan", "All that the primitives of a device make of a request.")
      .def(py::init<const string&>(), arg("request"))
      .def_property_readonly("count", &Plan::Count)
      .def("json", &Plan::Json, arg("part"), arg("number"), arg("most"))
      .def("tcl", &Plan::Tcl, arg("part"), arg("number"), arg("most"))
      .def("report", &Plan::Report, arg("part"), arg("number"), arg("most"), arg("width"))
      .def("sdc", &Plan::Sdc, arg("number"), arg("plain"), arg("fifos"), arg("gap"))
      .def("relations", &Plan::Relations, arg("number"), arg("gap"))
      .def("hdl", &Plan::Hdl, arg("number"), arg("vhdl"), arg("testbench"), arg("name"));

  py::class_<Explanation>(module, "Explanation", "Why a request fails, and what would do.")
      .def(py::init([](const string& request, const py::object& oscillators) {
             std::optional<string> inputs;
             if (!oscillators.is_none()) inputs = oscillators.cast<string>();
             return std::make_unique<Explanation>(request, inputs);
           }),
           arg("request"), arg("oscillators"))
      .def("json", &Explanation::Json)
      .def("report", &Explanation::Report, arg("width"));

  module.def(
      "devices",
      [](const py::object& name) {
        return Devices(name.is_none() ? std::nullopt : std::optional(name.cast<string>()));
      },
      arg("name"));
  module.def("shipped", &Device::Shipped, arg("folder"), arg("name"));
  module.def("check", &Check, arg("text"), arg("file"), arg("device"));
  module.def("verify", &Verify, arg("plan"), arg("file"));
}

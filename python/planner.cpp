// The extension vorkel._planner: the planner's library for the Python package that stands around
// it.
//
// What goes in is a request in JSON, and what comes out JSON and other texts; the package makes
// types of them. What goes wrong is raised by the package's own functions (vorkel/_errors.py),
// which get it as data.
//
// Python's other threads run while something is planned, and can plan themselves: plans share
// nothing.
//
// Tested by tests/python.
#include <pybind11/pybind11.h>

#include <cstddef>
#include <exception>
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
#include "planner/plan/Plan.h"
#include "planner/report/DevicesText.h"
#include "planner/report/ErrorData.h"
#include "planner/report/ExplainText.h"
#include "planner/report/Json.h"
#include "planner/report/PlanText.h"
#include "planner/report/VerifyText.h"
#include "planner/verify/Verify.h"
#include "python/Asked.h"
#include "python/Evaluation.h"
#include "python/Reachable.h"
#include "python/Refused.h"
#include "python/Writing.h"

namespace {

namespace py = pybind11;
using nlohmann::ordered_json;
using python::Asked;
using python::Evaluation;
using python::Reachable;
using python::Refused;
using std::string;

// Does something that knows no Python, while that goes on.
template <typename Work>
auto Beside(const Work& work) {
  const py::gil_scoped_release released;
  return work();
}

// What a plan is shown as.
enum class Part { kPlan, kCompare, kBest };

class Plan {
 public:
  explicit Plan(const string& request) : asked_(python::Read(request)) {
    plan_ = Beside([this] { return planner::plan::Make(asked_.request(), asked_.device); });
    if (!plan_.IsSolved()) python::RefuseUnsolved(plan_.refused, asked_.device);
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
  string Sdc(std::size_t number, bool plain, bool fifos, const string& gap) const {
    return python::Sdc(asked_, Candidate(number), plain, fifos, gap);
  }
  string Relations(std::size_t number, const string& gap) const {
    return python::Relations(asked_, Candidate(number), gap);
  }
  string Hdl(std::size_t number, bool is_vhdl, bool is_testbench, const string& name) const {
    return python::Hdl(asked_, Candidate(number), is_vhdl, is_testbench, name);
  }

 private:
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
      : asked_(python::Read(request)), has_own_inputs_(oscillators) {
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
    if (!mistakes.empty()) python::RefuseMistakes(mistakes);
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
    python::RefusePart(error);
  }
}

string Check(const py::bytes& text, const string& file, const string& device) {
  return python::Text(
      planner::report::CheckData(planner::device::Check(string(text), file, device), file));
}

string Verify(const string& plan, const string& file) {
  planner::Device device;
  if (const auto part = planner::verify::PartOf(plan)) {
    const auto files = planner::device::HostFiles();
    try {
      device = planner::device::Catalogue(*files).FindDevice(*part);
    } catch (const planner::device::PartError& error) {
      python::RefusePart(error);
    }
  }
  const auto wrong = Beside(
      [&] { return planner::verify::Verify(plan, device, &planner::report::JsonSentences()); });
  ordered_json data = ordered_json::array();
  for (const auto& one : wrong) data.push_back(planner::report::DiscrepancyData(one, file));
  return python::Text(data);
}

// A text, or none where that is None.
std::optional<string> Given(const py::object& text) {
  return text.is_none() ? std::nullopt : std::optional(text.cast<string>());
}

std::unique_ptr<Evaluation> Evaluated(const string& request, const py::list& settings,
                                      const py::object& plan, const py::object& number) {
  std::vector<Evaluation::Setting> all;
  for (const py::handle& one : settings) {
    const auto pair = one.cast<py::tuple>();
    all.emplace_back(pair[0].cast<string>(), pair[1].cast<string>());
  }
  std::optional<int> place;
  if (!number.is_none()) place = number.cast<int>();
  return std::make_unique<Evaluation>(request, all, Given(plan), place);
}

// Raises in Python what is thrown here.
void Raise(std::exception_ptr thrown) {
  try {
    if (thrown) std::rethrow_exception(thrown);
  } catch (const Refused& refused) {
    try {
      py::module_::import("vorkel._errors").attr(refused.function.c_str())(refused.data);
    } catch (py::error_already_set& raised) {
      raised.restore();
    }
  }
}

}  // namespace

PYBIND11_MODULE(_planner, module) {
  module.doc() = "The planner of vorkel. Use the package vorkel, which has types for all of it.";
  module.attr("version") = VORKEL_VERSION;

  py::register_exception_translator(&Raise);

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
             return std::make_unique<Explanation>(request, Given(oscillators));
           }),
           arg("request"), arg("oscillators"))
      .def("json", &Explanation::Json)
      .def("report", &Explanation::Report, arg("width"));

  py::class_<Evaluation>(module, "Evaluation", "What settings make that are there already.")
      .def(py::init(&Evaluated), arg("request"), arg("settings"), arg("plan"), arg("number"))
      .def("json", &Evaluation::Json)
      .def("tcl", &Evaluation::Tcl)
      .def("report", &Evaluation::Report, arg("width"))
      .def(
          "sdc",
          [](const Evaluation& self, bool plain, bool fifos, const string& gap) {
            return python::Sdc(self.asked(), self.answer(), plain, fifos, gap);
          },
          arg("plain"), arg("fifos"), arg("gap"))
      .def(
          "relations",
          [](const Evaluation& self, const string& gap) {
            return python::Relations(self.asked(), self.answer(), gap);
          },
          arg("gap"))
      .def(
          "hdl",
          [](const Evaluation& self, bool is_vhdl, bool is_testbench, const string& name) {
            return python::Hdl(self.asked(), self.answer(), is_vhdl, is_testbench, name);
          },
          arg("vhdl"), arg("testbench"), arg("name"));

  // Each can take a while.
  using Released = py::call_guard<py::gil_scoped_release>;
  py::class_<Reachable>(module, "Reach", "Which frequencies an output can have.")
      .def(py::init([](const string& request, int output, const py::object& lowest,
                       const py::object& highest) {
             return std::make_unique<Reachable>(request, output, Given(lowest), Given(highest));
           }),
           arg("request"), arg("output"), arg("lowest"), arg("highest"))
      .def("all", &Reachable::All, arg("most"), Released())
      .def("near", &Reachable::Near, arg("frequency"), arg("most"), Released())
      .def("gaps", &Reachable::Gaps, arg("most"), Released())
      .def("count", &Reachable::Count, Released());

  module.def(
      "devices", [](const py::object& name) { return Devices(Given(name)); }, arg("name"));
  module.def("shipped", &Device::Shipped, arg("folder"), arg("name"));
  module.def("check", &Check, arg("text"), arg("file"), arg("device"));
  module.def("verify", &Verify, arg("plan"), arg("file"));
}

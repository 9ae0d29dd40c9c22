// Tested by instance_test.cpp and hdl.test.
#include "planner/hdl/Instance.h"

#include <limits>
#include <optional>
#include <stdexcept>
#include <string_view>

#include "planner/hdl/Names.h"
#include "planner/report/Numbers.h"

namespace planner::hdl {

namespace {

using std::string;

constexpr std::int64_t kLargest = std::numeric_limits<std::int32_t>::max();
constexpr int kLoopOutputs = 7;

std::optional<Parts> Fitting(const Rational& value) {
  const std::optional<Rational::Words> words = value.InWords();
  if (!words || words->numerator > kLargest || words->denominator > kLargest) return std::nullopt;
  return Parts{words->numerator, words->denominator};
}

// A limit of the device. One that does not fit goes outwards, to a whole kHz: what keeps the limit
// is never told to break it.
Parts Outwards(const Rational& value, bool is_lowest) {
  if (const auto parts = Fitting(value)) return *parts;
  const Rational scaled = value * 1000;
  const Rational whole = is_lowest ? scaled.Floor() : -(-scaled).Floor();
  if (const auto parts = Fitting(whole / 1000)) return *parts;
  return is_lowest ? Parts{0, 1} : Parts{kLargest, 1};
}

class Builder {
 public:
  Builder(const Request& request, const Device& device, const Answer& answer)
      : request_(request), device_(device), answer_(answer) {}

  Instance Build() {
    const string primitive(Name(answer_.primitive));
    instance_.model = "VORKEL_" + primitive;
    instance_.label = LabelOf(answer_.primitive);
    AddPorts();
    if (const auto* loop = std::get_if<LoopSettings>(&answer_.settings)) {
      AddLoop(*loop);
    } else {
      AddKru(std::get<KruSettings>(answer_.settings));
    }
    return std::move(instance_);
  }

 private:
  static string OutputPort(std::size_t index) { return "clk_out" + std::to_string(index); }

  void AddPorts() {
    for (std::size_t n = 1; n <= request_.inputs.size(); ++n) {
      instance_.ports.push_back({"clk_in" + std::to_string(n)});
    }
    if (request_.inputs.size() > 1) instance_.ports.push_back({"clk_in_sel"});
    instance_.ports.push_back({"rst"});
    for (std::size_t i = 0; i < answer_.outputs.size(); ++i) {
      if (answer_.outputs[i].used) instance_.ports.push_back({OutputPort(i), true});
    }
    instance_.ports.push_back({"locked", true});
  }

  void Set(const string& name, std::int64_t number) {
    instance_.attributes.push_back({name, number});
  }
  void SetParts(const string& name, const Parts& parts) {
    Set(name + "_NUM", parts.numerator);
    Set(name + "_DEN", parts.denominator);
  }
  void SetRange(const string& name, const Range& range) {
    SetParts(name + "_MIN", Outwards(range.lowest, true));
    SetParts(name + "_MAX", Outwards(range.highest, false));
  }
  void Connect(const string& pin, const string& net, bool is_output = false) {
    instance_.connections.push_back({pin, net, is_output});
  }

  void AddLoop(const LoopSettings& loop);
  void AddKru(const KruSettings& kru);
  void AddPinLimits(const KruSettings& kru);
  void ConnectPins(const KruSettings& kru);

  const Request& request_;
  const Device& device_;
  const Answer& answer_;
  Instance instance_;
};

void Builder::AddLoop(const LoopSettings& loop) {
  const bool has_second = request_.inputs.size() > 1;
  SetParts("CLKIN1_MHZ", PartsOf(request_.inputs[0]));
  if (has_second) SetParts("CLKIN2_MHZ", PartsOf(request_.inputs[1]));
  instance_.attributes.push_back({"BANDWIDTH", string(Name(loop.bandwidth))});
  Set("M_EIGHTHS", loop.m);
  Set("D", loop.d);
  const LoopLimits& limits = device_.Loop(loop.primitive);
  Connect("CLKIN1", "clk_in1");
  Connect("CLKIN2", has_second ? "clk_in2" : "");
  Connect("CLKINSEL", has_second ? "clk_in_sel" : "");
  Connect("CLKFBIN", "clkfb");
  Connect("RST", "rst");
  Connect("CLKFBOUT", "clkfb", true);
  instance_.nets.emplace_back("clkfb");
  for (std::size_t i = 0; i < kLoopOutputs; ++i) {
    const string pin = "CLKOUT" + std::to_string(i);
    const bool is_used = i < answer_.outputs.size() && answer_.outputs[i].used;
    Connect(pin, is_used ? OutputPort(i) : "", true);
    if (!is_used) continue;
    Set(pin + "_DIVIDE_EIGHTHS", loop.outputs[i].divider);
    // Beside a fraction nothing can be moved.
    const bool moves = !loop.HasFraction();
    Set(pin + "_PHASE_EIGHTHS", moves ? loop.outputs[i].phase : 0);
    Set(pin + "_HIGH_HALVES", moves ? loop.outputs[i].high_time : 0);
  }
  SetRange("VCO", limits.vco);
  SetRange("PFD", limits.PfdOf(loop.bandwidth));
  SetRange("CLKOUT", limits.output);
  if (loop.primitive == Primitive::kPll) SetRange("CLKOUT1", limits.output_1);
  Set("MAX_COUNT", limits.max_count);
  Connect("LOCKED", "locked", true);
}

void Builder::AddPinLimits(const KruSettings& kru) {
  const bool is_doubled = !kru.pins.empty() && kru.pins[0] == hardware::Pin::kClk2x;
  for (const hardware::PinFacts& limited : hardware::kPins) {
    if (limited.limits != limited.name) continue;  // it has those of another pin
    for (const hardware::Pin pin : kru.pins) {
      if (pin == hardware::Pin::kNone || hardware::FactsOf(pin).limits != limited.name) continue;
      SetRange(string(limited.name), device_.Pins(kru.primitive).Of(pin, is_doubled));
      break;
    }
  }
}

// Each pin has the net of the first output on it; the other outputs there are copies.
void Builder::ConnectPins(const KruSettings& kru) {
  const bool is_sp = kru.primitive == Primitive::kKruSp;
  const bool is_doubled = !kru.pins.empty() && kru.pins[0] == hardware::Pin::kClk2x;
  const hardware::Pin back = is_doubled ? hardware::Pin::kClk2x : hardware::Pin::kClk0;
  string feedback;
  std::vector<Connection> pins;
  for (const hardware::PinFacts& facts : hardware::kPins) {
    if (is_sp ? !facts.is_sp : !facts.is_clkgen) continue;
    string net;
    for (std::size_t i = 0; i < kru.pins.size(); ++i) {
      if (kru.pins[i] != facts.pin || !answer_.outputs[i].used) continue;
      if (net.empty()) {
        net = OutputPort(i);
      } else {
        instance_.copies.push_back({OutputPort(i), net});
      }
    }
    if (kru.feedback && facts.pin == back) {
      if (net.empty()) {
        net = "clkfb";
        instance_.nets.push_back(net);
      }
      feedback = net;
    }
    pins.push_back({string(facts.name), net, true});
  }
  Connect("CLKIN", "clk_in1");
  if (is_sp) Connect("CLKFB", feedback);
  Connect("RST", "rst");
  instance_.connections.insert(instance_.connections.end(), pins.begin(), pins.end());
  Connect("LOCKED", "locked", true);
}

void Builder::AddKru(const KruSettings& kru) {
  const bool is_sp = kru.primitive == Primitive::kKruSp;
  SetParts("CLKIN_MHZ", PartsOf(request_.inputs[0]));
  if (is_sp) {
    const bool is_doubled = !kru.pins.empty() && kru.pins[0] == hardware::Pin::kClk2x;
    instance_.attributes.push_back({"CLKIN_DIVIDE_BY_2", Flag{kru.divide_by_2}});
    instance_.attributes.push_back({"CLK_FEEDBACK", string(!kru.feedback ? "NONE"
                                                           : is_doubled  ? "2X"
                                                                         : "1X")});
  }
  Set("M", kru.m);
  Set("D", kru.d);
  Set(is_sp ? "CLKDV_DIVIDE_HALVES" : "CLKFXDV_DIVIDE_HALVES", kru.divide_halves);
  if (is_sp) Set("PHASE_SHIFT", kru.phase_shift);
  AddPinLimits(kru);
  ConnectPins(kru);
}

}  // namespace

Instance InstanceOf(const Request& request, const Device& device, const Answer& answer) {
  return Builder(request, device, answer).Build();
}

string Refusal(const Request& request) {
  for (const Rational& input : request.inputs) {
    if (Fitting(input)) continue;
    return "the input of " + report::Quotient(input) +
           " MHz cannot be written exactly: both parts of this quotient must be at most " +
           std::to_string(kLargest) + "; give it with fewer digits";
  }
  return "";
}

Parts PartsOf(const Rational& value) {
  const std::optional<Rational::Words> words = value.InWords();
  if (!words) throw std::invalid_argument("a number with more than 63 bits");
  return {words->numerator, words->denominator};
}

}  // namespace planner::hdl

#include "tests/support/FakeHost.h"

#include <algorithm>
#include <cmath>
#include <cstdarg>
#include <cstdio>
#include <limits>

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/Port_Exception.h"
#include "host/Port_MsgManData.h"
#include "host/Tw_BmCMBCalculator.h"

FakeHost& FakeHost::Instance() {
  static FakeHost host;
  return host;
}

namespace {

void Run(const std::function<void()>& action) {
  if (action) action();
}

}  // namespace

void FakeHost::Reset() {
  const int living = personalities;
  *this = FakeHost{};
  personalities = living;
}

std::vector<std::string> FakeHost::MessageTexts() const {
  std::vector<std::string> texts;
  for (const Message& message : messages) texts.push_back(message.text);
  return texts;
}

double FigureFor(double value) {
  const double start = value / 1e9;
  double best = start;
  for (double figure :
       {start, std::nextafter(start, 0.0), std::nextafter(start, HUGE_VAL)}) {
    if (std::fabs(figure * 1e9 - value) < std::fabs(best * 1e9 - value)) best = figure;
  }
  return best;
}

void SetPll(const std::string& part, const FakePll& limits) {
  auto& keys = FakeHost::Instance().devices[part];
  keys["VCOCLK_FREQ_MIN"] = FigureFor(limits.vcoMin);
  keys["VCOCLK_FREQ_MAX"] = FigureFor(limits.vcoMax);
  keys["CLKOUT_FREQ_MIN_GCLK"] = FigureFor(limits.clkoutMin);
  keys["CLKOUT_FREQ_MAX_GCLK"] = FigureFor(limits.clkoutMax);
  keys["CLKPFD_FREQ_MIN"] = FigureFor(limits.pfdMin);
  keys["CLKPFD_FREQ_MAX"] = FigureFor(limits.pfdMax);
  keys["O_MAX_HT_LT"] = FigureFor(limits.maxHighLowCount);
  keys["CLKOUT_FREQ_MAX_IOCLK"] = FigureFor(limits.clkoutMaxIo);
}

void SetTsyn(const std::string& part, const FakeTsyn& limits) {
  auto& keys = FakeHost::Instance().devices[part];
  keys["TSYN_VCOCLK_FREQ_MIN"] = FigureFor(limits.vcoMin);
  keys["TSYN_VCOCLK_FREQ_MAX"] = FigureFor(limits.vcoMax);
  keys["TSYN_CLKOUT_FREQ_MIN"] = FigureFor(limits.clkoutMin);
  keys["TSYN_CLKOUT_FREQ_MAX"] = FigureFor(limits.clkoutMax);
  keys["TSYN_CLKPFD_FREQ_MIN"] = FigureFor(limits.pfdMin);
  keys["TSYN_CLKPFD_FREQ_MAX"] = FigureFor(limits.pfdMax);
  keys["TSYN_VCOCLK_FREQ_TARGET"] = FigureFor(limits.vcoTarget);
  keys["O_MAX_HT_LT"] = FigureFor(limits.maxHighLowCount);
  keys["TSYN_CLKPFD_FREQ_MAX_LBW"] = FigureFor(limits.maxPfdLowB);
}

// --- Device personality and speed data ---------------------------------------------------

struct PM_PIC::Data {
  std::string part;
};

PM_PIC::PM_PIC(const Port::StringBase& partName, bool, PM_PARTNAME_BINDING)
    : data_(std::make_unique<Data>()) {
  data_->part = partName.CStr();
  if (!FakeHost::Instance().devices.contains(data_->part)) {
    throw Port::Exception("Fake", "no such device");
  }
  Run(FakeHost::Instance().whilePersonalityIsMade);
  ++FakeHost::Instance().personalities;
}

PM_PIC::~PM_PIC() { --FakeHost::Instance().personalities; }

bool PM_PIC::fill_defaults() {
  ++FakeHost::Instance().fillDefaultsCalls;
  return true;
}

struct Dly_SpeedController::Data {
  std::string part;
};

Dly_SpeedController::Dly_SpeedController(const PM_PIC* pic) : data_(std::make_unique<Data>()) {
  data_->part = pic->data().part;
  const auto& without = FakeHost::Instance().withoutSpeedData;
  if (std::find(without.begin(), without.end(), data_->part) != without.end()) {
    throw Port::Exception("Fake", "no speed data");
  }
  Run(FakeHost::Instance().whileControllerIsMade);
  ++FakeHost::Instance().controllers;
}

Dly_SpeedController::~Dly_SpeedController() = default;

double Dly_SpeedController::GetBelDelay(const Port::StringBase& key, const Pds_PdmBlock*) const {
  FakeHost& host = FakeHost::Instance();
  host.reads.emplace_back(key.CStr());
  const auto& keys = host.devices[data_->part];
  const auto found = keys.find(key.CStr());
  return found == keys.end() ? std::numeric_limits<double>::max() : found->second;
}

// --- Messages ------------------------------------------------------------------------------

namespace {

class FakeMessage : public Port_MsgManData {
 public:
  explicit FakeMessage(FakeHost::Message head) : message_(std::move(head)) {}

  void issueError(const char* format, ...) override {
    char text[4096];
    std::va_list arguments;
    va_start(arguments, format);
    std::vsnprintf(text, sizeof text, format, arguments);
    va_end(arguments);
    message_.text = text;
    FakeHost::Instance().messages.push_back(message_);
  }

 private:
  FakeHost::Message message_;
};

}  // namespace

Port_MsgManData::~Port_MsgManData() = default;

std::unique_ptr<Port_MsgManData> Port_MsgManData::createObject(const char* category,
                                                               const char* source, int line,
                                                               const char* revision) {
  return std::make_unique<FakeMessage>(FakeHost::Message{category, source, revision, "", line});
}

// --- Calculator ----------------------------------------------------------------------------

Tw_BmCMBCalculator::~Tw_BmCMBCalculator() = default;

bool Tw_BmCMBCalculator::Unused(Port::StringBase*) { return false; }

Tw_BmCMBCalculator* Tw_BmPhysicalBlockModeler::GetCMBCalculator(Dly_SpeedController*) {
  ++FakeHost::Instance().calculatorRequests;
  Run(FakeHost::Instance().whileCalculatorIsMade);
  return FakeHost::Instance().calculator;
}

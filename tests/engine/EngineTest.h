// What the tests of the engine's stages share.
#ifndef VORKEL_TESTS_ENGINE_ENGINETEST_H_
#define VORKEL_TESTS_ENGINE_ENGINETEST_H_

#include <cmath>
#include <functional>
#include <limits>
#include <memory>
#include <new>
#include <stdexcept>
#include <string>
#include <vector>

#include "engine/Ip_VorkelImp.h"
#include "engine/Trace.h"
#include "tests/support/CaptureTrace.h"

namespace engine_test {

inline constexpr double kNan = std::numeric_limits<double>::quiet_NaN();
inline constexpr double kInfinity = std::numeric_limits<double>::infinity();

// The neighbours of a double.
inline double Above(double x) { return std::nextafter(x, kInfinity); }
inline double Below(double x) { return std::nextafter(x, -kInfinity); }

// A fresh implementation object. It lives as long as the process: speed controllers are shared
// by the address of the personality, so an address that was used again would meet the
// controller of another device.
inline Ip::VorkelImp& NewImp() {
  static auto* const objects = new std::vector<std::unique_ptr<Ip::VorkelImp>>;
  objects->push_back(std::make_unique<Ip::VorkelImp>(nullptr));
  return *objects->back();
}

// Everything that `stage(trace)` prints with the trace on, or off.
template <typename Stage>
std::string TraceOf(Stage stage, bool on = true) {
  CaptureTrace capture;
  {
    const Ip::Trace trace(on);
    stage(trace);
  }
  return capture.Text();
}

// Actions that throw what no host service promises to.
inline std::vector<std::function<void()>> Throwers() {
  return {[] { throw std::bad_alloc(); }, [] { throw std::runtime_error("broken"); },
          [] { throw 17; }};
}

inline std::string Repeat(const std::string& text, int times) {
  std::string all;
  for (int i = 0; i < times; ++i) all += text;
  return all;
}

// How often `part` stands in `text`.
inline int CountOf(const std::string& part, const std::string& text) {
  int count = 0;
  for (std::size_t at = text.find(part); at != std::string::npos;
       at = text.find(part, at + part.size())) {
    ++count;
  }
  return count;
}

// Puts a candidate with nothing but these into a slot.
inline void PutBare(Ip::Pll::VcoCandidateTable& table, int slot, double vco, double div0) {
  table.Put(slot, vco, div0);
  table[slot] = Ip::Pll::VcoCandidate{};
  table[slot].vco = vco;
  table[slot].div0 = div0;
}

// The slots of a set, in the order of its iteration.
template <typename Set>
std::vector<int> SlotsOf(const Set& set) {
  std::vector<int> slots;
  for (const int slot : set) slots.push_back(slot);
  return slots;
}

}  // namespace engine_test

#endif  // VORKEL_TESTS_ENGINE_ENGINETEST_H_

// Devices for which work is counted: limits of a PLL or TSYN, as the engine and as `check` read
// them.
#ifndef VORKEL_TESTS_COST_DEVICE_H_
#define VORKEL_TESTS_COST_DEVICE_H_

#include <string>
#include <vector>

#include "tests/compare/KruGenerator.h"
#include "tests/compare/Random.h"
#include "tests/plain/plain_pll.h"

namespace cost {

inline constexpr const char* kName = "dev";

struct Device {
  int prim = plain::kPrimTsyn;
  plain::PllLimits limits;
};

// What `check` says of a device file with these limits.
struct Verdict {
  bool isAccepted = false;  // without a warning
  bool isLong = false;      // with the warning that searches can be long
};
Verdict Check(const Device& device);

// The limits of a device file, of each of its grades and primitives. Those of KRUs are left out.
std::vector<Device> ReadDevices(const std::string& path, const std::string& name);

// Limits of all sizes that go together. VCOs from `slowest` to `fastest` MHz.
Device DrawDevice(double slowest, double fastest, compare::Random& random);

// The text of a device file, of the device kName.
std::string FileOf(const Device& device);
std::string FileOf(const compare::KruCase& drawn);

}  // namespace cost

#endif  // VORKEL_TESTS_COST_DEVICE_H_

// Calls of the engine for a device whose file is made for them, and the work of each.
#ifndef VORKEL_TESTS_COST_COUNTEDCALLS_H_
#define VORKEL_TESTS_COST_COUNTEDCALLS_H_

#include <cstdint>
#include <string>

#include "engine/Ip_VorkelImp.h"
#include "tests/compare/KruGenerator.h"
#include "tests/host/device_folder.h"
#include "tests/plain/plain_pll.h"

namespace cost {

// The device is found as long as this is there.
class CountedCalls {
 public:
  explicit CountedCalls(const std::string& deviceFile);

  // The work of a call.
  std::uint64_t WorkOf(const plain::PllRequest& request);
  std::uint64_t WorkOf(const compare::KruCase& drawn);

 private:
  DeviceFolder folder_;
  SearchPath path_;
  Ip::VorkelImp& imp_;
};

}  // namespace cost

#endif  // VORKEL_TESTS_COST_COUNTEDCALLS_H_

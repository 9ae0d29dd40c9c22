// A part of a device whose file is made for it, and calls of the engine for this part.
#ifndef VORKEL_TESTS_WORK_PART_H_
#define VORKEL_TESTS_WORK_PART_H_

#include <cstdint>
#include <string>

#include "engine/Ip_VorkelImp.h"
#include "tests/compare/KruGenerator.h"
#include "tests/host/device_folder.h"
#include "tests/plain/plain_pll.h"

namespace work {

// Its device is found as long as the part is there.
class Part {
 public:
  explicit Part(const std::string& deviceFile);

  // The work of a call.
  std::uint64_t WorkOf(const plain::PllRequest& request);
  std::uint64_t WorkOf(const compare::KruCase& drawn);

 private:
  DeviceFolder folder_;
  SearchPath path_;
  Ip::VorkelImp& imp_;
};

}  // namespace work

#endif  // VORKEL_TESTS_WORK_PART_H_

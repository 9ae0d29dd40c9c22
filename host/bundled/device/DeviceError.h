// Why a device cannot be had, in one sentence for the user.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_DEVICEERROR_H_
#define VORKEL_HOST_BUNDLED_DEVICE_DEVICEERROR_H_

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace Device {

class DeviceError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// A place in a text file; lines and columns count from 1.
struct SourcePosition {
  unsigned line = 1;
  unsigned column = 1;
};

// "<path>:<line>:<column>: <reason>".
DeviceError ErrorAt(const std::string& path, SourcePosition position, std::string_view reason);

// "a, b, c".
std::string JoinNames(const std::vector<std::string>& names);

// Issues `reason` as an error through the message manager, then throws Port::Exception with
// the same text.
[[noreturn]] void ReportAndThrow(const std::string& reason);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_DEVICEERROR_H_

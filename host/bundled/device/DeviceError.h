// Why a device cannot be had, in one sentence for the user: what is from a device file or a script
// is shown without control characters, and cut where it is endless.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_DEVICEERROR_H_
#define VORKEL_HOST_BUNDLED_DEVICE_DEVICEERROR_H_

#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace Device {

// A place in a text file; lines and columns count from 1, columns in characters.
struct SourcePosition {
  unsigned line = 1;
  unsigned column = 1;
  bool operator==(const SourcePosition&) const = default;
};

class DeviceError : public std::runtime_error {
 public:
  // About no file in particular.
  explicit DeviceError(const std::string& reason) : std::runtime_error(reason), reason_(reason) {}
  // About a file, at a place or as a whole: "<path>:<line>:<column>: <reason>", or without the
  // place.
  DeviceError(std::string path, std::optional<SourcePosition> position, std::string reason);

  const std::string& path() const { return path_; }  // empty when it is about no file
  const std::optional<SourcePosition>& position() const { return position_; }
  const std::string& reason() const { return reason_; }  // without file and place

 private:
  std::string path_;
  std::optional<SourcePosition> position_;
  std::string reason_;
};

// The error with that place in a file.
DeviceError ErrorAt(const std::string& path, SourcePosition position, std::string_view reason);

// A name in quotes.
std::string Quoted(std::string_view text);

// "a, b, c".
std::string JoinNames(const std::vector<std::string>& names);

// Issues `reason` as an error through the message manager, then throws Port::Exception with
// the same text.
[[noreturn]] void ReportAndThrow(const std::string& reason);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_DEVICEERROR_H_

#include "host/bundled/device/DeviceError.h"

#include <utility>

#include "host/Port_Exception.h"
#include "host/Port_MsgManData.h"
#include "host/bundled/port/ShownText.h"

namespace Device {
namespace {

constexpr char kCategory[] = "DesignEntry";
constexpr char kSource[] = "host/device";
constexpr char kRevision[] = "1.0";

// In bytes. A list or what the TOML parser says can be as long as a device file.
constexpr std::size_t kLongestName = 100;
constexpr std::size_t kLongestReason = 1000;

std::string Sentence(const std::string& path, const std::optional<SourcePosition>& position,
                     const std::string& reason) {
  std::string text = Port::Escaped(path);
  if (position) {
    text += ':' + std::to_string(position->line);
    text += ':' + std::to_string(position->column);
  }
  return text + ": " + Port::Shown(reason, kLongestReason);
}

}  // namespace

DeviceError::DeviceError(std::string path, std::optional<SourcePosition> position,
                         std::string reason)
    : std::runtime_error(Sentence(path, position, reason)),
      path_(std::move(path)),
      position_(position),
      reason_(std::move(reason)) {}

DeviceError ErrorAt(const std::string& path, SourcePosition position, std::string_view reason) {
  return DeviceError(path, position, std::string(reason));
}

std::string Quoted(std::string_view text) { return '"' + Port::Shown(text, kLongestName) + '"'; }

std::string JoinNames(const std::vector<std::string>& names) {
  std::string joined;
  for (const std::string& name : names) {
    if (!joined.empty()) joined += ", ";
    joined += name;
  }
  return Port::Shown(joined, kLongestReason);
}

void ReportAndThrow(const std::string& reason) {
  Port_MsgManData::createObject(kCategory, kSource, __LINE__, kRevision)
      ->issueError("%s", reason.c_str());
  throw Port::Exception(kCategory, Port::StringBase(reason));
}

}  // namespace Device

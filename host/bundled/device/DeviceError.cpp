#include "host/bundled/device/DeviceError.h"

#include "host/Port_Exception.h"
#include "host/Port_MsgManData.h"

namespace Device {
namespace {

constexpr char kCategory[] = "DesignEntry";
constexpr char kSource[] = "host/device";
constexpr char kRevision[] = "1.0";

}  // namespace

DeviceError ErrorAt(const std::string& path, SourcePosition position, std::string_view reason) {
  std::string text = path;
  text += ':' + std::to_string(position.line);
  text += ':' + std::to_string(position.column) + ": ";
  text += reason;
  return DeviceError(text);
}

std::string JoinNames(const std::vector<std::string>& names) {
  std::string joined;
  for (const std::string& name : names) {
    if (!joined.empty()) joined += ", ";
    joined += name;
  }
  return joined;
}

void ReportAndThrow(const std::string& reason) {
  Port_MsgManData::createObject(kCategory, kSource, __LINE__, kRevision)
      ->issueError("%s", reason.c_str());
  throw Port::Exception(kCategory, Port::StringBase(reason));
}

}  // namespace Device

// Tested by part_text_test.cpp.
#include "planner/report/PartText.h"

#include <vector>

#include "planner/read/Shown.h"

namespace planner::report {

namespace {

using device::PartError;
using read::Shown;
using read::ShownWhole;
using std::string;

string Listed(const std::vector<string>& names) {
  string text;
  for (const string& name : names) text += (text.empty() ? "" : ", ") + ShownWhole(name);
  return text;
}

string LacksPart(const PartError& error, const string& kind) {
  return error.device + " has no " + kind + " \"" + Shown(error.detail) + "\"; it has " +
         Listed(error.candidates);
}

}  // namespace

string ComplaintText(const device::FileComplaint& complaint) {
  string text = ShownWhole(complaint.file);
  if (complaint.line) text += ":" + std::to_string(*complaint.line);
  if (complaint.column) text += ":" + std::to_string(*complaint.column);
  return text + ": " + ShownWhole(complaint.reason);
}

string PartText(const PartError& error) {
  switch (error.kind) {
    case PartError::Kind::kUnknownPackage:
      return LacksPart(error, "package");
    case PartError::Kind::kUnknownGrade:
      return LacksPart(error, "grade");
    case PartError::Kind::kNoDefaultGrade:
      return error.device + " has no default grade; it has " + Listed(error.candidates);
    case PartError::Kind::kAmbiguous:
      return "device \"" + Shown(error.name) + "\" could be " + Listed(error.candidates);
    case PartError::Kind::kBadFile:
      return ComplaintText(error.complaints.front());
    case PartError::Kind::kUnknownDevice:
      break;
  }
  string text =
      "unknown device \"" + Shown(error.name) + "\"; the devices are " + Listed(error.candidates);
  for (const device::FileComplaint& complaint : error.complaints) {
    text += "; it could be a part of " + ShownWhole(complaint.device) +
            ", whose file is bad: " + ComplaintText(complaint);
  }
  return text;
}

string LacksText(const Device& device, Primitive primitive) {
  std::vector<string> names;
  for (const Primitive one : device.primitives) names.emplace_back(Name(one));
  return device.part + " has no " + string(Name(primitive)) + "; it has " + Listed(names);
}

string LacksAllText(const Device& device) {
  return device.part + " has the limits of no primitive";
}

}  // namespace planner::report

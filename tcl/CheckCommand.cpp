// Tested by devices.test.
#include <nlohmann/json.hpp>

#include "planner/device/Check.h"
#include "planner/report/Data.h"
#include "planner/report/DoubtText.h"
#include "planner/report/TclDict.h"
#include "tcl/Commands.h"
#include "tcl/Failure.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

using nlohmann::ordered_json;
using std::string;

constexpr std::string_view kEnding = ".toml";
constexpr int kLargest = 1'000'000;  // bytes

// Through Tcl, so that files of a virtual file system are files, too.
string Contents(const string& path) {
  Tcl_Obj* const name = Object(path);
  Tcl_IncrRefCount(name);
  Tcl_Channel channel = Tcl_FSOpenFileChannel(nullptr, name, "r", 0);
  Tcl_DecrRefCount(name);
  if (channel == nullptr) {
    throw Failure::OfUsage("no_file", path, path + ": " + Tcl_ErrnoMsg(Tcl_GetErrno()));
  }
  Tcl_SetChannelOption(nullptr, channel, "-translation", "binary");
  string bytes(static_cast<std::size_t>(kLargest) + 1, '\0');
  const int count = Tcl_Read(channel, bytes.data(), kLargest + 1);
  const int error = Tcl_GetErrno();
  Tcl_Close(nullptr, channel);
  if (count < 0) throw Failure::OfUsage("no_file", path, path + ": " + Tcl_ErrnoMsg(error));
  if (count > kLargest) {
    throw Failure::OfUsage("no_file", path, path + ": it is too large for a device file");
  }
  bytes.resize(static_cast<std::size_t>(count));
  return bytes;
}

ordered_json MistakeData(const planner::device::Mistake& mistake) {
  ordered_json data;
  data["places"] = ordered_json::array();
  for (const auto& place : mistake.places) {
    data["places"].push_back({{"line", place.line}, {"column", place.column}});
  }
  data["unknown"] = mistake.unknown;
  data["known"] = mistake.known;
  data["message"] = mistake.reason;
  return data;
}

ordered_json DoubtData(const planner::device::Doubt& doubt) {
  ordered_json data;
  data["keyword"] = doubt.keyword;
  planner::report::AddExact(&data, "value", doubt.value);
  data["other"] = doubt.other;
  data["grades"] = doubt.grades;
  data["lines"] = doubt.lines;
  data["touched"] = ordered_json::array();
  for (const planner::Primitive one : doubt.touched) data["touched"].push_back(Name(one));
  data["lost"] = ordered_json::array();
  for (const planner::Primitive one : doubt.lost) data["lost"].push_back(Name(one));
  data["message"] = planner::report::DoubtText(doubt);
  return data;
}

ordered_json GradeData(const planner::device::GradeDescription& grade) {
  ordered_json data;
  data["name"] = grade.name;
  data["primitives"] = ordered_json::array();
  for (const planner::Primitive one : grade.primitives) data["primitives"].push_back(Name(one));
  data["missing"] = ordered_json::array();
  for (const planner::device::Missing& one : planner::device::MissingOf(grade)) {
    data["missing"].push_back(one.keyword.name);
  }
  return data;
}

}  // namespace

string Check(Words words) {
  if (words.size() != 1) {
    throw Failure::OfUsage("wrong_words", "", "wrong # args: should be \"vorkel::check file\"");
  }
  const string path = Text(words.front());
  const string name = path.substr(path.rfind('/') + 1);
  if (name.size() <= kEnding.size() || !name.ends_with(kEnding)) {
    throw Failure::OfUsage("no_file", path, path + ": a device file is named DEVICE.toml");
  }
  const auto checked = planner::device::Check(Contents(path), path,
                                              name.substr(0, name.size() - kEnding.size()));
  ordered_json data;
  data["file"] = path;
  data["usable"] = checked.mistakes.empty();
  data["mistakes"] = ordered_json::array();
  for (const auto& mistake : checked.mistakes) data["mistakes"].push_back(MistakeData(mistake));
  data["untold"] = checked.untold;
  data["warnings"] = ordered_json::array();
  for (const auto& doubt : checked.doubts) data["warnings"].push_back(DoubtData(doubt));
  data["grades"] = ordered_json::array();
  for (const auto& grade : checked.description.grades) data["grades"].push_back(GradeData(grade));
  return planner::report::TclDict(data);
}

}  // namespace tcl

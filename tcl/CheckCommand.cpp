// Tested by devices.test.
#include <nlohmann/json.hpp>

#include "host/TclVersion.h"
#include "planner/device/Check.h"
#include "planner/report/ErrorData.h"
#include "planner/report/TclDict.h"
#include "tcl/Commands.h"
#include "tcl/Failure.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

using std::string;

constexpr std::string_view kEnding = ".toml";
constexpr int kLargest = 1'000'000;  // bytes

// Through Tcl, so that files of a virtual file system are files, too. To Tcl a tilde at the
// beginning is somebody's folder; here it is a letter of a name.
string Contents(const string& path) {
  Tcl_Obj* const name = Object(path.starts_with('~') ? "./" + path : path);
  Tcl_IncrRefCount(name);
  Tcl_Channel channel = Tcl_FSOpenFileChannel(nullptr, name, "r", 0);
  Tcl_DecrRefCount(name);
  if (channel == nullptr) {
    throw Failure::OfUsage("no_file", path, path + ": " + Tcl_ErrnoMsg(Tcl_GetErrno()));
  }
  Tcl_SetChannelOption(nullptr, channel, "-translation", "binary");
  string bytes(static_cast<std::size_t>(kLargest) + 1, '\0');
  const Tcl::Size count = Tcl_Read(channel, bytes.data(), kLargest + 1);
  const int error = Tcl_GetErrno();
  Tcl_Close(nullptr, channel);
  if (count < 0) throw Failure::OfUsage("no_file", path, path + ": " + Tcl_ErrnoMsg(error));
  if (count > kLargest) {
    throw Failure::OfUsage("no_file", path, path + ": it is too large for a device file");
  }
  bytes.resize(static_cast<std::size_t>(count));
  return bytes;
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
  const auto checked =
      planner::device::Check(Contents(path), path, name.substr(0, name.size() - kEnding.size()));
  return planner::report::TclDict(planner::report::CheckData(checked, path));
}

}  // namespace tcl

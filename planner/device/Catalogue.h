// What the names stand for that users give parts.
//
// A part name is <device>[<package>][-<grade>], in any case of letters: "vk40", "VK40b484-2".
// Nothing marks where the device ends, so a name can begin with several devices; the longest
// that has such a package and grade is meant. What is left out is the device's default.
//
// Tested by catalogue_test.cpp.
#ifndef VORKEL_PLANNER_DEVICE_CATALOGUE_H_
#define VORKEL_PLANNER_DEVICE_CATALOGUE_H_

#include <exception>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "host/bundled/device/DeviceFile.h"
#include "planner/Device.h"
#include "planner/device/Files.h"

namespace planner::device {

// A device in one package and grade.
struct Part {
  ::Device::DeviceFile file;
  std::string package;  // empty when the name gives none and there is no default
  std::string grade;

  // The full name: "vk40b484-2".
  std::string Name() const;
};

// Why a device file cannot be read: the place, where there is one, and a sentence without it.
struct FileComplaint {
  std::string device;
  std::string file;
  std::optional<unsigned> line;  // both count from 1
  std::optional<unsigned> column;
  std::string reason;
};

FileComplaint ComplaintOf(std::string_view device, const ::Device::DeviceError& error);

// Why a name stands for no part.
class PartError : public std::exception {
 public:
  enum class Kind {
    kUnknownDevice,   // candidates: all devices
    kUnknownPackage,  // `device` has no package `detail`; candidates: those that it has
    kUnknownGrade,    // likewise
    kNoDefaultGrade,  // the name has no grade and `device` no default; candidates: its grades
    kAmbiguous,       // the beginning of several names, or several in other cases: candidates
    kBadFile,         // the file of the device that is meant, or may be: complaints
  };

  explicit PartError(Kind what_kind) : kind(what_kind) {}
  const char* what() const noexcept override;

  Kind kind;
  std::string name;    // as the user wrote it
  std::string device;  // as its file has it
  std::string detail;  // what there is not, as the user wrote it
  std::vector<std::string> candidates;
  // The files that could not be read on the way: with kBadFile the first is the reason, else
  // they may hide what was meant. `device` is that of the first then.
  std::vector<FileComplaint> complaints;
};

// Looks names up in files, which must outlive it. Each call reads the files that it needs; nothing
// is kept.
class Catalogue {
 public:
  explicit Catalogue(const Files& files) : files_(files) {}

  // The device of that very name in any case; throws PartError when there is none, or its file is
  // bad.
  ::Device::DeviceFile Read(std::string_view device) const;

  // Throws PartError when the name stands for no part. A device whose file is bad is never passed
  // over in favour of one with a shorter name. But where none of the others fits either, and it
  // is not certain that it was meant, the name is unknown, and the file is among the complaints.
  Part Resolve(std::string_view name) const;

  // Like Resolve, but takes the beginning of a name, too, if only one goes on like it: that of a
  // device, or of a device and its package, either with a grade or without.
  Part Find(std::string_view name) const;
  planner::Device FindDevice(std::string_view name) const;

  // A device as `devices NAME` shows it: with all its grades when the name, or its beginning, says
  // no more than the device, and else with the one that it stands for. Throws as Find does.
  struct Selection {
    ::Device::DeviceFile file;
    std::vector<std::string> grades;
  };
  Selection Select(std::string_view name) const;

  // The names that `name` is the beginning of: those of devices, or else those of devices with a
  // package. A file that cannot be read has no packages.
  std::vector<std::string> Completions(std::string_view name) const;

 private:
  // Those of a device; none when its file cannot be read.
  std::vector<std::string> PackagesOf(std::string_view device) const;

  const Files& files_;
};

}  // namespace planner::device

#endif  // VORKEL_PLANNER_DEVICE_CATALOGUE_H_

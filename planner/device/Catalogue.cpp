#include "planner/device/Catalogue.h"

#include <algorithm>
#include <cstddef>
#include <utility>

#include "host/bundled/device/DeviceError.h"
#include "planner/device/FromFile.h"

namespace planner::device {
namespace {

using ::Device::DeviceFile;
using Names = std::vector<std::string>;

char Lower(char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

bool IsSame(std::string_view a, std::string_view b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                    [](char one, char other) { return Lower(one) == Lower(other); });
}

bool BeginsWith(std::string_view text, std::string_view beginning) {
  return text.size() >= beginning.size() && IsSame(text.substr(0, beginning.size()), beginning);
}

// Those of some names that are `name` in this very case, or else in any.
Names Matching(const Names& names, std::string_view name) {
  Names matching;
  for (const std::string& one : names) {
    if (one == name) return {one};
    if (IsSame(one, name)) matching.push_back(one);
  }
  return matching;
}

PartError Error(PartError::Kind kind, std::string_view name, Names candidates) {
  PartError error(kind);
  error.name = name;
  error.candidates = std::move(candidates);
  return error;
}

PartError BadFile(std::string_view name, std::vector<FileComplaint> complaints) {
  PartError error(PartError::Kind::kBadFile);
  error.name = name;
  error.device = complaints.front().device;
  error.complaints = std::move(complaints);
  return error;
}

// The lengths that a device of which `name` is a part name can have, the longest first.
std::vector<std::size_t> PrefixLengths(const Names& devices, std::string_view name) {
  std::vector<std::size_t> lengths;
  for (const std::string& device : devices) {
    if (BeginsWith(name, device)) lengths.push_back(device.size());
  }
  std::sort(lengths.begin(), lengths.end());
  lengths.erase(std::unique(lengths.begin(), lengths.end()), lengths.end());
  std::reverse(lengths.begin(), lengths.end());
  return lengths;
}

// What a part name says behind the device.
struct Rest {
  explicit Rest(std::string_view rest)
      : package(rest.substr(0, rest.find('-'))), has_grade(rest.find('-') < rest.size()) {
    if (has_grade) grade = rest.substr(package.size() + 1);
  }
  std::string_view package;
  bool has_grade;
  std::string_view grade;
};

// Takes a package or a grade out of those that the device has; what is wrong with it, or nothing.
std::optional<PartError> TakeMember(PartError::Kind kind, const Names& known,
                                    std::string_view detail, const DeviceFile& file,
                                    std::string* member) {
  const Names matching = Matching(known, detail);
  if (matching.size() == 1) {
    *member = matching.front();
    return std::nullopt;
  }
  PartError error(kind);
  error.device = file.device;
  error.detail = detail;
  error.candidates = known;
  return error;
}

// Fills in the package and the grade of a part; what is wrong with them, or nothing. A device may
// do without a default package, but its limits are those of a grade.
std::optional<PartError> TakeRest(const Rest& rest, Part* part) {
  const DeviceFile& file = part->file;
  part->package = file.default_package.value_or("");
  part->grade = file.default_grade.value_or("");
  if (!rest.package.empty()) {
    auto wrong = TakeMember(PartError::Kind::kUnknownPackage, file.packages, rest.package, file,
                            &part->package);
    if (wrong) return wrong;
  }
  if (rest.has_grade) {
    return TakeMember(PartError::Kind::kUnknownGrade, file.GradeNames(), rest.grade, file,
                      &part->grade);
  }
  if (!part->grade.empty()) return std::nullopt;
  PartError error(PartError::Kind::kNoDefaultGrade);
  error.device = file.device;
  error.candidates = file.GradeNames();
  return error;
}

}  // namespace

FileComplaint ComplaintOf(std::string_view device, const ::Device::DeviceError& error) {
  FileComplaint complaint;
  complaint.device = device;
  complaint.file = error.path();
  complaint.reason = error.reason();
  if (error.position()) {
    complaint.line = error.position()->line;
    complaint.column = error.position()->column;
  }
  return complaint;
}

std::string Part::Name() const { return file.device + package + '-' + grade; }

const char* PartError::what() const noexcept { return "a name that stands for no part"; }

DeviceFile Catalogue::Read(std::string_view name) const {
  const Names names = files_.Names();
  const Names matching = Matching(names, name);
  if (matching.empty()) throw Error(PartError::Kind::kUnknownDevice, name, names);
  if (matching.size() > 1) throw Error(PartError::Kind::kAmbiguous, name, matching);
  const std::string& device = matching.front();
  try {
    return DeviceFile::Parse(files_.TextOf(device), files_.PathOf(device), device);
  } catch (const ::Device::DeviceError& error) {
    throw BadFile(name, {ComplaintOf(device, error)});
  }
}

Part Catalogue::Resolve(std::string_view name) const {
  const Names names = files_.Names();
  PartError complaint = Error(PartError::Kind::kUnknownDevice, name, names);
  std::vector<FileComplaint> bad_files;
  for (const std::size_t length : PrefixLengths(names, name)) {
    Part part;
    try {
      part.file = Read(name.substr(0, length));
    } catch (const PartError& error) {
      // The rest may else be a package of this device, or the name that of another one.
      const bool names_device = length == name.size() || name[length] == '-';
      if (names_device || error.kind != PartError::Kind::kBadFile) throw;
      bad_files.push_back(error.complaints.front());
      continue;
    }
    auto wrong = TakeRest(Rest(name.substr(length)), &part);
    if (!wrong) {
      if (!bad_files.empty()) throw BadFile(name, std::move(bad_files));
      return part;
    }
    if (complaint.kind == PartError::Kind::kUnknownDevice) complaint = std::move(*wrong);
  }
  complaint.name = name;
  complaint.complaints = std::move(bad_files);
  throw complaint;
}

Part Catalogue::Find(std::string_view name) const {
  try {
    return Resolve(name);
  } catch (const PartError& error) {
    // Then it is known which device is meant.
    if (error.kind == PartError::Kind::kBadFile || error.kind == PartError::Kind::kNoDefaultGrade) {
      throw;
    }
    const Names matches = Completions(name);
    if (matches.size() > 1) throw Error(PartError::Kind::kAmbiguous, name, matches);
    if (matches.empty() || IsSame(matches.front(), name)) throw;
    return Resolve(matches.front());
  }
}

planner::Device Catalogue::FindDevice(std::string_view name) const {
  const Part part = Find(name);
  return FromFile(part.file, part.package, part.grade);
}

Catalogue::Selection Catalogue::Select(std::string_view name) const {
  const Names names = files_.Names();
  const Names completions = Completions(name);
  const bool is_device = !Matching(names, name).empty();
  if (is_device || (completions.size() == 1 && !Matching(names, completions.front()).empty())) {
    Selection selection{Read(is_device ? std::string(name) : completions.front()), {}};
    selection.grades = selection.file.GradeNames();
    return selection;
  }
  Part part = Find(name);
  return {std::move(part.file), {std::move(part.grade)}};
}

Names Catalogue::Completions(std::string_view name) const {
  const std::string_view head = name.substr(0, name.find('-'));
  const std::string grade(name.substr(head.size()));
  if (head.empty()) return {};
  Names devices;
  Names packages;
  for (const std::string& device : files_.Names()) {
    if (BeginsWith(device, head)) {
      devices.push_back(device + grade);
    } else if (BeginsWith(head, device)) {
      for (const std::string& package : PackagesOf(device)) {
        if (BeginsWith(device + package, head)) packages.push_back(device + package + grade);
      }
    }
  }
  return devices.empty() ? packages : devices;
}

Names Catalogue::PackagesOf(std::string_view device) const {
  try {
    return Read(device).packages;
  } catch (const PartError&) {
    return {};
  }
}

}  // namespace planner::device

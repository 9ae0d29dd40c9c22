// The devices that there are, by the names of their files.
//
// Tested by device_catalogue_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_DEVICECATALOGUE_H_
#define VORKEL_HOST_BUNDLED_DEVICE_DEVICECATALOGUE_H_

#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace Device {

class DeviceCatalogue {
 public:
  // Lists the search path as it is now. The search path is the folders of the environment
  // variable VORKEL_DEVICES (colon-separated, empty entries skipped), then the bundled
  // folder. A folder that is not there or cannot be listed counts as empty. No file is opened.
  static DeviceCatalogue List();

  // The same for folders of the caller's choice.
  static DeviceCatalogue ListFolders(std::vector<std::string> folders);

  // The device names, sorted.
  std::vector<std::string> Names() const;

  // The device names with which `part_name` begins, the longest first.
  std::vector<std::string> PrefixesOf(std::string_view part_name) const;

  // The file of a device, from the first folder that has one; null when there is none.
  const std::string* FindFile(std::string_view device) const;

  const std::vector<std::string>& folders() const { return folders_; }

 private:
  void AddFolder(const std::string& folder);

  std::vector<std::string> folders_;
  std::map<std::string, std::string, std::less<>> files_;  // path by device name
};

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_DEVICECATALOGUE_H_

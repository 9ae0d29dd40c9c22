// A folder of device files for one test, and the search path that leads to it.
#ifndef VORKEL_TESTS_HOST_DEVICE_FOLDER_H_
#define VORKEL_TESTS_HOST_DEVICE_FOLDER_H_

#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <optional>
#include <stdexcept>
#include <string>

// A folder that is removed, with all that is in it, at the end of its scope.
class DeviceFolder {
 public:
  DeviceFolder() {
    std::string name = std::filesystem::temp_directory_path() / "vorkel_devices_XXXXXX";
    if (mkdtemp(name.data()) == nullptr) throw std::runtime_error("no temporary folder");
    path_ = name;
  }
  ~DeviceFolder() { std::filesystem::remove_all(path_); }
  DeviceFolder(const DeviceFolder&) = delete;
  DeviceFolder& operator=(const DeviceFolder&) = delete;

  const std::string& path() const { return path_; }
  std::string File(const std::string& name) const { return path_ + '/' + name; }

  // Writes a file and returns its path.
  std::string Write(const std::string& name, const std::string& text) const {
    std::ofstream(File(name), std::ios::binary) << text;
    return File(name);
  }

  // Writes the file of a device with packages p1 and p2 (default) and grades g1 and g2
  // (default), which differ in their highest VCO frequency, 1000 and 1100 MHz.
  std::string WriteDevice(const std::string& device) const {
    return Write(device + ".toml", "device = \"" + device +
                                       "\"\n"
                                       "packages = [\"p1\", \"p2\"]\n"
                                       "default_package = \"p2\"\n"
                                       "default_grade = \"g2\"\n"
                                       "[grade.g1]\n"
                                       "VCOCLK_FREQ_MAX = 1000\n"
                                       "[grade.g2]\n"
                                       "VCOCLK_FREQ_MAX = 1100\n");
  }

 private:
  std::string path_;
};

// The variable VORKEL_DEVICES, set back at the end of the scope.
class SearchPath {
 public:
  explicit SearchPath(const std::string& folders) : before_(Now()) {
    setenv(kVariable, folders.c_str(), 1);
  }
  ~SearchPath() {
    if (before_.has_value()) {
      setenv(kVariable, before_->c_str(), 1);
    } else {
      unsetenv(kVariable);
    }
  }
  SearchPath(const SearchPath&) = delete;
  SearchPath& operator=(const SearchPath&) = delete;

 private:
  static constexpr char kVariable[] = "VORKEL_DEVICES";

  static std::optional<std::string> Now() {
    const char* const value = getenv(kVariable);
    return value == nullptr ? std::nullopt : std::optional<std::string>(value);
  }

  std::optional<std::string> before_;
};

#endif  // VORKEL_TESTS_HOST_DEVICE_FOLDER_H_

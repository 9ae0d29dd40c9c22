// The device files that come with the library.
#include <gtest/gtest.h>

#include <map>
#include <set>

#include "host/bundled/device/KeywordTable.h"
#include "host/bundled/device/Personality.h"
#include "host/bundled/device/SpeedFigure.h"
#include "tests/host/device_folder.h"

namespace {

using Device::DeviceCatalogue;
using Device::DeviceFile;
using Device::Grade;

DeviceFile Bundled(std::string_view device) {
  return *FindDevice(DeviceCatalogue::ListFolders({BUNDLED_DEVICES}), device);
}

std::vector<DeviceFile> AllBundled() {
  std::vector<DeviceFile> files;
  for (const std::string& device : DeviceCatalogue::ListFolders({BUNDLED_DEVICES}).Names()) {
    files.push_back(Bundled(device));
  }
  return files;
}

std::map<std::string, double> Figures(const Grade& grade) {
  std::map<std::string, double> figures;
  for (std::size_t i = 0; i < Device::Keywords().size(); ++i) {
    if (grade.figures[i]) figures.emplace(Device::Keywords()[i].name, *grade.figures[i]);
  }
  return figures;
}

// The keywords that the named primitives need.
std::set<std::string> KeywordsOf(unsigned primitives) {
  std::set<std::string> names;
  for (const Device::Keyword& keyword : Device::Keywords()) {
    if ((keyword.primitives & primitives) != 0) names.emplace(keyword.name);
  }
  return names;
}

void ExpectPrimitives(const Grade& grade, unsigned primitives) {
  std::set<std::string> names;
  for (const auto& [name, figure] : Figures(grade)) names.insert(name);
  EXPECT_EQ(names, KeywordsOf(primitives));
}

TEST(BundledDevices, AreThree) {
  EXPECT_EQ(DeviceCatalogue::ListFolders({BUNDLED_DEVICES}).Names(),
            (std::vector<std::string>{"vk10", "vk20", "vk40"}));
}

TEST(BundledDevices, HaveTheirPrimitives) {
  ExpectPrimitives(*Bundled("vk10").FindGrade("1"),
                   Device::kPll | Device::kKruSp | Device::kKruClkgen);
  ExpectPrimitives(*Bundled("vk20").FindGrade("2"), Device::kTsyn);
  const DeviceFile vk40 = Bundled("vk40");
  for (const char* grade : {"1", "2"}) {
    ExpectPrimitives(*vk40.FindGrade(grade),
                     Device::kPll | Device::kTsyn | Device::kKruSp | Device::kKruClkgen);
  }
}

TEST(BundledDevices, HaveDefaults) {
  for (const DeviceFile& file : AllBundled()) {
    EXPECT_TRUE(file.default_package.has_value()) << file.path;
    EXPECT_TRUE(file.default_grade.has_value()) << file.path;
    EXPECT_FALSE(file.description.empty()) << file.path;
  }
  EXPECT_EQ(Bundled("vk40").default_grade, "2");
}

// Every part name that the files allow, and every limit as the engine reads it.
TEST(BundledDevices, ComeBackExactly) {
  const SearchPath path(BUNDLED_DEVICES);
  int limits = 0;
  for (const DeviceFile& file : AllBundled()) {
    for (const Grade& grade : file.grades) {
      for (const std::string& package : file.packages) {
        const std::string part_name = file.device + package + '-' + grade.name;
        const PM_PIC pic(std::string_view(part_name), true, PM_PARTNAME_BINDING_USUAL);
        const Dly_SpeedController controller(&pic);
        for (const auto& [name, figure] : Figures(grade)) {
          const double delay = controller.GetBelDelay(std::string_view(name), nullptr);
          EXPECT_EQ(delay * Device::kSpeedDataScale, figure) << part_name << ' ' << name;
          ++limits;
        }
      }
    }
  }
  EXPECT_EQ(limits, 2 * 23 + 2 * 9 + 3 * 2 * 31);
}

TEST(BundledDevices, HaveNoEmptyRanges) {
  int ranges = 0;
  for (const DeviceFile& file : AllBundled()) {
    for (const Grade& grade : file.grades) {
      const auto figures = Figures(grade);
      for (const auto& [name, figure] : figures) {
        const std::size_t place = name.find("MIN");
        if (place == std::string::npos) continue;
        const auto largest = figures.find(std::string(name).replace(place, 3, "MAX"));
        if (largest == figures.end()) continue;
        EXPECT_LT(figure, largest->second) << file.path << ' ' << name;
        ++ranges;
      }
    }
  }
  // PLL 3, TSYN 3, KRU_SP 5, CLKFXDV 1.
  EXPECT_EQ(ranges, (3 + 5 + 1) + 3 + 2 * (3 + 3 + 5 + 1));
}

TEST(BundledDevices, AreNotWiderAtTheSlowerGrade) {
  const DeviceFile vk40 = Bundled("vk40");
  const auto slow = Figures(*vk40.FindGrade("1"));
  const auto fast = Figures(*vk40.FindGrade("2"));
  int wider = 0;
  for (const auto& [name, figure] : slow) {
    const bool is_lower_end = name.find("MIN") != std::string::npos;
    const double gain = is_lower_end ? figure - fast.at(name) : fast.at(name) - figure;
    EXPECT_GE(gain, 0) << name;
    if (gain > 0) ++wider;
  }
  EXPECT_GT(wider, 10);
}

}  // namespace

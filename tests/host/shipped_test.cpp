#include "host/bundled/device/Shipped.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "tests/host/device_folder.h"

namespace {

namespace fs = std::filesystem;

// Makes folders in a new one, and asks from some of them for "devices".
class Shipped : public testing::Test {
 protected:
  void Make(const std::string& folder) { fs::create_directories(root_.File(folder)); }
  std::string From(const std::string& folder) {
    Make(folder);
    const std::string found = Device::Shipped(root_.File(folder), "devices");
    return found.starts_with(root_.path()) ? found.substr(root_.path().size() + 1) : found;
  }

  const DeviceFolder root_;
};

TEST_F(Shipped, StandsBesideTheProgramBeforeAllElse) {
  Make("prefix/share/vorkel/devices");
  Make("prefix/bin/ip_vorkel1.1/devices");
  Make("prefix/bin/devices");
  EXPECT_EQ(From("prefix/bin"), "prefix/bin/devices");
}

TEST_F(Shipped, StandsInThePackageOfTheBuildTree) {
  Make("build/ip_vorkel1.1/devices");
  EXPECT_EQ(From("build"), "build/ip_vorkel1.1/devices");
  EXPECT_EQ(From("build/vorkel1.1"), "build/ip_vorkel1.1/devices");
  EXPECT_EQ(From("build/other/vorkel1.1"), "");
}

TEST_F(Shipped, StandsBelowThePrefixOfAnInstallation) {
  Make("a b/share/vorkel/devices");
  for (const char* const folder : {"a b/bin", "a b/lib/tcltk/ip_vorkel1.1", "a b/lib/arch",
                                   "a b/lib/python3/dist-packages/vorkel"}) {
    EXPECT_EQ(From(folder), "a b/share/vorkel/devices") << folder;
  }
}

// The nearest prefix is the one that it has been installed to.
TEST_F(Shipped, StandsBelowTheNearestPrefix) {
  Make("usr/share/vorkel/devices");
  Make("usr/local/share/vorkel/devices");
  EXPECT_EQ(From("usr/local/bin"), "usr/local/share/vorkel/devices");
  EXPECT_EQ(From("usr/bin"), "usr/share/vorkel/devices");
}

TEST_F(Shipped, StandsNowhereElse) {
  Make("p/share/vorkel/devices");
  EXPECT_EQ(From("p/1/2/3/4"), "p/share/vorkel/devices");
  EXPECT_EQ(From("p/1/2/3/4/5"), "");
  EXPECT_EQ(From("q/bin"), "");
  EXPECT_EQ(Device::Shipped("", "devices"), "");
}

}  // namespace

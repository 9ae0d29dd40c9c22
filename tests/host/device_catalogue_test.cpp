#include <gtest/gtest.h>

#include <algorithm>

#include "host/bundled/device/BundledFolder.h"
#include "host/bundled/device/DeviceCatalogue.h"
#include "tests/host/device_folder.h"

namespace {

using Device::DeviceCatalogue;
using Strings = std::vector<std::string>;

TEST(DeviceCatalogue, ListsFilesByTheirNames) {
  const DeviceFolder folder;
  folder.Write("b.toml", "not even TOML");
  folder.Write("a.toml", "");
  folder.Write("c.toml.old", "");
  folder.Write("toml", "");
  folder.Write(".toml", "");
  std::filesystem::create_directory(folder.File("dir.toml"));
  const auto catalogue = DeviceCatalogue::ListFolders({folder.path()});
  EXPECT_EQ(catalogue.Names(), (Strings{"a", "b", "dir"}));
  ASSERT_NE(catalogue.FindFile("b"), nullptr);
  EXPECT_EQ(*catalogue.FindFile("b"), folder.File("b.toml"));
  EXPECT_EQ(catalogue.FindFile("B"), nullptr);
  EXPECT_EQ(catalogue.FindFile(""), nullptr);
}

TEST(DeviceCatalogue, TakesTheFileOfTheEarlierFolder) {
  const DeviceFolder first;
  const DeviceFolder second;
  first.WriteDevice("both");
  second.WriteDevice("both");
  second.WriteDevice("single");
  const auto forth = DeviceCatalogue::ListFolders({first.path(), second.path()});
  EXPECT_EQ(*forth.FindFile("both"), first.File("both.toml"));
  EXPECT_EQ(*forth.FindFile("single"), second.File("single.toml"));
  const auto back = DeviceCatalogue::ListFolders({second.path(), first.path()});
  EXPECT_EQ(*back.FindFile("both"), second.File("both.toml"));
}

TEST(DeviceCatalogue, PassesOverFoldersThatAreNotThere) {
  const DeviceFolder folder;
  folder.WriteDevice("a");
  const std::string file = folder.Write("plain", "");
  const auto catalogue = DeviceCatalogue::ListFolders({folder.File("absent"), file, folder.path()});
  EXPECT_EQ(catalogue.Names(), Strings{"a"});
}

TEST(DeviceCatalogue, ReadsTheVariableAtEachLookUp) {
  const DeviceFolder first;
  const DeviceFolder second;
  first.WriteDevice("catalogue_first");
  second.WriteDevice("catalogue_second");
  {
    const SearchPath path(":" + first.path() + "::" + second.path() + ":");
    const auto catalogue = DeviceCatalogue::List();
    EXPECT_EQ(catalogue.folders(), (Strings{first.path(), second.path(), Device::BundledFolder()}));
    EXPECT_NE(catalogue.FindFile("catalogue_first"), nullptr);
    EXPECT_NE(catalogue.FindFile("catalogue_second"), nullptr);
  }
  const SearchPath path("");
  const auto catalogue = DeviceCatalogue::List();
  EXPECT_EQ(catalogue.folders(), Strings{Device::BundledFolder()});
  EXPECT_EQ(catalogue.FindFile("catalogue_first"), nullptr);
}

TEST(DeviceCatalogue, FindsThePrefixesOfAPartNameLongestFirst) {
  const DeviceFolder folder;
  for (const char* device : {"v", "vk", "vk1", "vk10", "vk2", "wk"}) folder.WriteDevice(device);
  const auto catalogue = DeviceCatalogue::ListFolders({folder.path()});
  EXPECT_EQ(catalogue.PrefixesOf("vk10q144"), (Strings{"vk10", "vk1", "vk", "v"}));
  EXPECT_EQ(catalogue.PrefixesOf("vk1"), (Strings{"vk1", "vk", "v"}));
  EXPECT_EQ(catalogue.PrefixesOf("Vk1"), Strings());
  EXPECT_EQ(catalogue.PrefixesOf(""), Strings());
}

TEST(BundledFolder, IsAbsoluteAndBesideTheProgram) {
  const std::filesystem::path folder = Device::BundledFolder();
  EXPECT_TRUE(folder.is_absolute());
  EXPECT_EQ(folder.filename(), "devices");
  EXPECT_EQ(folder.parent_path(), std::filesystem::canonical("/proc/self/exe").parent_path());
}

}  // namespace

#include "planner/device/Catalogue.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "host/bundled/device/DeviceCatalogue.h"
#include "tests/host/device_folder.h"
#include "tests/planner/device/memory_files.h"

namespace {

using planner::device::Catalogue;
using planner::device::Part;
using planner::device::PartError;
using testing::ElementsAre;
using testing::IsEmpty;
using Kind = planner::device::PartError::Kind;

class CatalogueTest : public testing::Test {
 protected:
  std::string Resolved(const std::string& name) { return catalogue_.Resolve(name).Name(); }
  std::string Found(const std::string& name) { return catalogue_.Find(name).Name(); }

  PartError ErrorOf(const std::string& name) { return ErrorIn([&] { catalogue_.Find(name); }); }
  template <typename Action>
  PartError ErrorIn(Action action) {
    try {
      action();
    } catch (const PartError& error) {
      return error;
    }
    ADD_FAILURE() << "no error";
    return PartError(Kind::kUnknownDevice);
  }

  MemoryFiles files_;
  Catalogue catalogue_{files_};
};

TEST_F(CatalogueTest, FillsInWhatANameLeavesOut) {
  files_.Add("vk10");
  EXPECT_EQ(Resolved("vk10"), "vk10P2-2");
  EXPECT_EQ(Resolved("vk10p1"), "vk10p1-2");
  EXPECT_EQ(Resolved("vk10-1"), "vk10P2-1");
  EXPECT_EQ(Resolved("vk10p1-1"), "vk10p1-1");
  const Part part = catalogue_.Resolve("vk10p1-1");
  EXPECT_EQ(part.file.path, "memory/vk10.toml");
  EXPECT_EQ(part.package, "p1");
  EXPECT_EQ(part.grade, "1");
}

TEST_F(CatalogueTest, TakesNamesInAnyCase) {
  files_.Add("Vk10", "\"q144\", \"B256\"", "default_grade = \"1\"\n");
  EXPECT_EQ(Resolved("vK10b256-2"), "Vk10B256-2");
  EXPECT_EQ(Resolved("VK10Q144"), "Vk10q144-1");
  EXPECT_EQ(Found("vk1"), "Vk10-1");
  EXPECT_EQ(Found("VK10B"), "Vk10B256-1");
}

TEST_F(CatalogueTest, PrefersTheVeryName) {
  files_.Add("VK");
  files_.Add("vk");
  EXPECT_EQ(Resolved("VKp1"), "VKp1-2");
  EXPECT_EQ(Resolved("vk"), "vkP2-2");
  const PartError error = ErrorOf("Vk");
  EXPECT_EQ(error.kind, Kind::kAmbiguous);
  EXPECT_EQ(error.name, "Vk");
  EXPECT_THAT(error.candidates, ElementsAre("VK", "vk"));
}

TEST_F(CatalogueTest, MeansTheLongestDeviceThatFits) {
  files_.Add("a3", "\"0\", \"0b\", \"c\"", "default_grade = \"1\"\n");
  files_.Add("a30", "\"b\"", "default_grade = \"2\"\n");
  EXPECT_EQ(Resolved("a30b"), "a30b-2");
  EXPECT_EQ(Resolved("a30"), "a30-2");
  EXPECT_EQ(Resolved("a3c"), "a3c-1");
  files_.Add("a30b", "\"x\"", "default_grade = \"1\"\n");
  EXPECT_EQ(Resolved("a30b"), "a30b-1");
}

TEST_F(CatalogueTest, TellsWhatThereIsNot) {
  files_.Add("vk10");
  files_.Add("vk20");
  PartError error = ErrorOf("xyz");
  EXPECT_EQ(error.kind, Kind::kUnknownDevice);
  EXPECT_EQ(error.name, "xyz");
  EXPECT_THAT(error.candidates, ElementsAre("vk10", "vk20"));
  EXPECT_THAT(error.complaints, IsEmpty());

  error = ErrorOf("VK10zz-1");
  EXPECT_EQ(error.kind, Kind::kUnknownPackage);
  EXPECT_EQ(error.name, "VK10zz-1");
  EXPECT_EQ(error.device, "vk10");
  EXPECT_EQ(error.detail, "zz");
  EXPECT_THAT(error.candidates, ElementsAre("p1", "P2"));

  error = ErrorOf("vk10p1-9");
  EXPECT_EQ(error.kind, Kind::kUnknownGrade);
  EXPECT_EQ(error.detail, "9");
  EXPECT_THAT(error.candidates, ElementsAre("1", "2"));
  EXPECT_EQ(ErrorOf("vk10-").kind, Kind::kUnknownGrade);
  EXPECT_EQ(ErrorOf("").kind, Kind::kUnknownDevice);
}

// Of several devices with which a name begins, the longest is told of.
TEST_F(CatalogueTest, TellsOfTheLongestDevice) {
  files_.Add("a");
  files_.Add("ab");
  const PartError error = ErrorOf("abz");
  EXPECT_EQ(error.kind, Kind::kUnknownPackage);
  EXPECT_EQ(error.device, "ab");
  EXPECT_EQ(error.detail, "z");
}

TEST_F(CatalogueTest, NeedsAGradeButNoPackage) {
  files_.Add("a", "\"p\"", "");
  PartError error = ErrorOf("a");
  EXPECT_EQ(error.kind, Kind::kNoDefaultGrade);
  EXPECT_EQ(error.device, "a");
  EXPECT_THAT(error.candidates, ElementsAre("1", "2"));
  EXPECT_EQ(Resolved("a-2"), "a-2");
}

TEST_F(CatalogueTest, CompletesBeginnings) {
  files_.Add("vk10", "\"q144\", \"b256\"", "default_grade = \"1\"\n");
  files_.Add("vk20", "\"b256\", \"b484\"", "default_grade = \"1\"\n");
  files_.Add("w");
  EXPECT_THAT(catalogue_.Completions("V"), ElementsAre("vk10", "vk20"));
  EXPECT_THAT(catalogue_.Completions("vk1-2"), ElementsAre("vk10-2"));
  EXPECT_THAT(catalogue_.Completions("vk20b"), ElementsAre("vk20b256", "vk20b484"));
  EXPECT_THAT(catalogue_.Completions("VK20B2-2"), ElementsAre("vk20b256-2"));
  EXPECT_THAT(catalogue_.Completions(""), IsEmpty());
  EXPECT_THAT(catalogue_.Completions("-2"), IsEmpty());
  EXPECT_THAT(catalogue_.Completions("x"), IsEmpty());
  EXPECT_EQ(Found("vk1-2"), "vk10-2");
  EXPECT_EQ(Found("vk10q"), "vk10q144-1");
  const PartError error = ErrorOf("vk20b");
  EXPECT_EQ(error.kind, Kind::kAmbiguous);
  EXPECT_THAT(error.candidates, ElementsAre("vk20b256", "vk20b484"));
  EXPECT_EQ(ErrorOf("vk").kind, Kind::kAmbiguous);
  // It is the beginning of one name, which has no such grade.
  EXPECT_EQ(ErrorOf("vk1-9").kind, Kind::kUnknownGrade);
}

TEST_F(CatalogueTest, ABadFileIsToldOfWhenItIsMeant) {
  files_.texts["a3"] = "device = \"a3\"\npackages = 1\n";
  files_.Add("a30");
  const PartError error = ErrorOf("A3");
  EXPECT_EQ(error.kind, Kind::kBadFile);
  EXPECT_EQ(error.device, "a3");
  ASSERT_EQ(error.complaints.size(), 1u);
  EXPECT_EQ(error.complaints[0].file, "memory/a3.toml");
  EXPECT_EQ(error.complaints[0].line, 2u);
  EXPECT_EQ(error.complaints[0].column, 12u);
  EXPECT_EQ(error.complaints[0].reason, "\"packages\" must be a list of texts");
  // What follows a dash is a grade: no other device can be meant.
  EXPECT_EQ(ErrorOf("a3-1").kind, Kind::kBadFile);
}

TEST_F(CatalogueTest, ABadFileBesideIsNotInTheWay) {
  files_.texts["a3"] = "device = \"a3\"\npackages = 1\n";
  files_.Add("a30x");
  EXPECT_EQ(Found("a30x"), "a30xP2-2");
  EXPECT_EQ(Found("a30"), "a30xP2-2");
  // Nobody knows whether a3 has such a package: the name is unknown, and the file a remark.
  const PartError error = ErrorOf("a31");
  EXPECT_EQ(error.kind, Kind::kUnknownDevice);
  EXPECT_EQ(error.name, "a31");
  ASSERT_EQ(error.complaints.size(), 1u);
  EXPECT_EQ(error.complaints[0].device, "a3");
}

// It may be the bad one that is meant.
TEST_F(CatalogueTest, ABadFileIsNotPassedOverForAShorterName) {
  files_.Add("a", "\"bc\"", "default_grade = \"1\"\n");
  EXPECT_EQ(Found("abc"), "abc-1");
  files_.texts["ab"] = "nonsense";
  const PartError error = ErrorOf("abc");
  EXPECT_EQ(error.kind, Kind::kBadFile);
  EXPECT_EQ(error.name, "abc");
  EXPECT_EQ(error.device, "ab");
  EXPECT_EQ(Found("a"), "a-1");
}

TEST_F(CatalogueTest, AFileThatCannotBeReadHasNoPlace) {
  files_.Add("a");
  files_.unreadable = "a";
  const PartError error = ErrorOf("a");
  EXPECT_EQ(error.kind, Kind::kBadFile);
  EXPECT_EQ(error.complaints[0].file, "memory/a.toml");
  EXPECT_EQ(error.complaints[0].line, std::nullopt);
  EXPECT_EQ(error.complaints[0].reason, "is gone");
}

TEST_F(CatalogueTest, MakesDevices) {
  files_.Add("a");
  EXPECT_EQ(catalogue_.FindDevice("Ap1").part, "ap1-2");
}

TEST_F(CatalogueTest, SelectsAllGradesOfADeviceOrOne) {
  files_.Add("vk10", "\"p1\"", "");
  files_.Add("vk20");
  EXPECT_THAT(catalogue_.Select("VK10").grades, ElementsAre("1", "2"));
  EXPECT_THAT(catalogue_.Select("vk1").grades, ElementsAre("1", "2"));
  EXPECT_EQ(catalogue_.Select("vk1").file.device, "vk10");
  EXPECT_THAT(catalogue_.Select("vk20-1").grades, ElementsAre("1"));
  EXPECT_THAT(catalogue_.Select("vk2-1").grades, ElementsAre("1"));
  EXPECT_THAT(catalogue_.Select("vk20p1").grades, ElementsAre("2"));
  EXPECT_EQ(ErrorIn([&] { catalogue_.Select("vk20p"); }).kind, Kind::kAmbiguous);
  EXPECT_EQ(ErrorIn([&] { catalogue_.Select("vk"); }).kind, Kind::kAmbiguous);
  EXPECT_EQ(ErrorIn([&] { catalogue_.Select("x"); }).kind, Kind::kUnknownDevice);
}

TEST(HostFiles, AreThoseOfTheCatalogue) {
  DeviceFolder folder;
  folder.WriteDevice("dev");
  const auto files = planner::device::HostFiles(
      ::Device::DeviceCatalogue::ListFolders({folder.path()}));
  EXPECT_THAT(files->Names(), ElementsAre("dev"));
  EXPECT_EQ(files->PathOf("dev"), folder.File("dev.toml"));
  EXPECT_EQ(files->PathOf("other"), "");
  EXPECT_THROW(files->TextOf("other"), ::Device::DeviceError);
  EXPECT_EQ(Catalogue(*files).Find("DEVp1-g1").Name(), "devp1-g1");
}

TEST(HostFiles, AreThoseOfTheSearchPath) {
  DeviceFolder folder;
  folder.WriteDevice("dev");
  const SearchPath path(folder.path());
  EXPECT_THAT(planner::device::HostFiles()->Names(), testing::Contains("dev"));
}

// For who catches it as an exception; its sentence is in report/PartText.h.
TEST(PartError, IsAnException) {
  EXPECT_STREQ(PartError(Kind::kAmbiguous).what(), "a name that stands for no part");
}

}  // namespace

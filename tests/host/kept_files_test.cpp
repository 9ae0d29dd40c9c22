#include "host/bundled/device/KeptFiles.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cstddef>
#include <memory>
#include <string>
#include <thread>
#include <vector>

#include "tests/host/device_folder.h"

namespace {

using Device::DeviceFile;
using Device::kMostKeptFiles;
using Device::ReadKept;

using File = std::shared_ptr<const DeviceFile>;

class KeptFilesTest : public testing::Test {
 protected:
  // A file of a device whose grade 1 has that count.
  std::string Write(const std::string& device, int count) {
    return folder_.Write(device + ".toml", "device = \"" + device +
                                               "\"\npackages = [\"p\"]\n[grade.1]\n"
                                               "O_MAX_HT_LT = " +
                                               std::to_string(count) + "\n");
  }

  static double CountOf(const File& file) {
    return file->FindGrade("1")->Figure("O_MAX_HT_LT").value();
  }

  // Why it cannot be read; "" when it can.
  static std::string Failure(const std::string& path, const std::string& device) {
    try {
      ReadKept(path, device);
      return "";
    } catch (const Device::DeviceError& error) {
      return error.what();
    }
  }

  DeviceFolder folder_;
};

TEST_F(KeptFilesTest, AnUnchangedFileIsParsedOnce) {
  const std::string path = Write("dev", 64);
  const File first = ReadKept(path, "dev");
  EXPECT_EQ(CountOf(first), 64.0);
  EXPECT_EQ(first->path, path);
  EXPECT_EQ(ReadKept(path, "dev"), first);
  // Another date is no other text.
  Write("dev", 64);
  EXPECT_EQ(ReadKept(path, "dev"), first);
}

// Of the same size, in the same place, and under the same date.
TEST_F(KeptFilesTest, AChangeIsSeenUnderAnyDate) {
  const std::string path = Write("dev", 64);
  struct stat before {};
  ASSERT_EQ(stat(path.c_str(), &before), 0);
  const File first = ReadKept(path, "dev");
  Write("dev", 32);
  const std::array<timespec, 2> dates = {before.st_atim, before.st_mtim};
  ASSERT_EQ(utimensat(AT_FDCWD, path.c_str(), dates.data(), 0), 0);
  EXPECT_EQ(CountOf(ReadKept(path, "dev")), 32.0);
  EXPECT_EQ(CountOf(first), 64.0);
  Write("dev", 64);
  EXPECT_EQ(CountOf(ReadKept(path, "dev")), 64.0);
}

TEST_F(KeptFilesTest, WhatIsWrongWithAFileNowIsFoundNow) {
  const std::string path = Write("dev", 64);
  ReadKept(path, "dev");
  folder_.Write("dev.toml", "device = \"dev\"\n\nx = 1\n");
  EXPECT_EQ(Failure(path, "dev").substr(0, path.size() + 6), path + ":3:1: ");
  std::filesystem::remove(path);
  EXPECT_EQ(Failure(path, "dev"), path + ": cannot be read: No such file or directory");
  std::filesystem::create_directory(path);
  EXPECT_EQ(Failure(path, "dev"), path + ": cannot be read: it is a directory");
  std::filesystem::remove(path);
  Write("dev", 64);
  EXPECT_EQ(Failure(path, "dev"), "");
}

// The same text at another path, or for another device, is another file.
TEST_F(KeptFilesTest, PathAndDeviceAreThoseOfTheQuestion) {
  const std::string path = Write("dev", 64);
  const File first = ReadKept(path, "dev");
  const std::string copy = folder_.File("copy.toml");
  std::filesystem::copy_file(path, copy);
  const File second = ReadKept(copy, "dev");
  EXPECT_NE(second, first);
  EXPECT_EQ(second->path, copy);
  EXPECT_EQ(Failure(copy, "copy"),
            copy + ":1:10: device \"dev\" must be named as its file, \"copy\"");
}

TEST_F(KeptFilesTest, OfManyTheLastAreKept) {
  std::vector<File> files;
  const auto path = [&](std::size_t i) { return folder_.File("d" + std::to_string(i) + ".toml"); };
  const auto read = [&](std::size_t i) { return ReadKept(path(i), "d" + std::to_string(i)); };
  for (std::size_t i = 0; i <= kMostKeptFiles; ++i) {
    Write("d" + std::to_string(i), 64);
    files.push_back(read(i));
    EXPECT_EQ(read(0), files[0]) << "asked for again and again, it stays";
  }
  EXPECT_EQ(read(2), files[2]);
  EXPECT_EQ(read(kMostKeptFiles), files[kMostKeptFiles]);
  EXPECT_NE(read(1), files[1]) << "asked for longest ago";
}

TEST_F(KeptFilesTest, AFileThatGrewIsReadToItsEnd) {
  const std::string path = Write("dev", 64);
  ReadKept(path, "dev");
  const std::string comment(100000, '#');
  folder_.Write("dev.toml", comment + "\ndevice = \"dev\"\npackages = [\"p\"]\n[grade.1]\n" +
                                "O_MAX_HT_LT = 7\n");
  EXPECT_EQ(CountOf(ReadKept(path, "dev")), 7.0);
}

TEST_F(KeptFilesTest, ThreadsCanAskAtOnce) {
  constexpr std::size_t kThreads = 3;
  const std::string path = Write("dev", 64);
  std::array<int, kThreads> right{};
  std::vector<std::thread> threads;
  for (std::size_t t = 0; t < kThreads; ++t) {
    threads.emplace_back([&, t] {
      const std::string own = "t" + std::to_string(t);
      const std::string own_path = Write(own, static_cast<int>(t) + 1);
      for (int i = 0; i < 200; ++i) {
        if (CountOf(ReadKept(path, "dev")) == 64.0 &&
            CountOf(ReadKept(own_path, own)) == static_cast<double>(t) + 1.0) {
          ++right[t];
        }
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  for (const int each : right) EXPECT_EQ(each, 200);
}

}  // namespace

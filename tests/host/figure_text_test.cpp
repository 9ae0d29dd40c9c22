#include "host/bundled/device/FigureText.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "host/bundled/device/DeviceCatalogue.h"
#include "host/bundled/device/DeviceFile.h"

namespace {

using Device::DeviceFile;
using Device::FigureText;

std::string DecimalAt(std::string_view text, unsigned line, unsigned column) {
  return FigureText(text).DecimalAt({line, column});
}

TEST(FigureText, IsTheNumberAsItStandsThere) {
  EXPECT_EQ(DecimalAt("A = 187.617", 1, 5), "187.617");
  EXPECT_EQ(DecimalAt("A = 187.617\nB = 2.50 # 3\n", 2, 5), "2.50");
  EXPECT_EQ(DecimalAt("A = 1.5\r\nB = 2.5\r\n", 2, 5), "2.5");
  EXPECT_EQ(DecimalAt("g = {a=1.5,b=2.5}", 1, 8), "1.5");
  EXPECT_EQ(DecimalAt("g = {a=1.5,b=2.5}", 1, 14), "2.5");
}

TEST(FigureText, HasNoSignsAndUnderscores) {
  EXPECT_EQ(DecimalAt("+1_234.567_8", 1, 1), "1234.5678");
  EXPECT_EQ(DecimalAt("1_0E+0_2", 1, 1), "10e02");
  EXPECT_EQ(DecimalAt("5.5e-3", 1, 1), "5.5e-3");
}

// Columns are characters, here of one, two, three and four bytes; a byte order mark is none.
TEST(FigureText, CountsCharacters) {
  EXPECT_EQ(DecimalAt("a\xc3\xbc\xe2\x82\xac\xf0\x9f\x95\x90=1.25", 1, 6), "1.25");
  EXPECT_EQ(DecimalAt("\xef\xbb\xbf" "A=1.25\nB=2", 1, 3), "1.25");
  EXPECT_EQ(DecimalAt("\xef\xbb\xbf" "A=1.25\nB=2", 2, 3), "2");
}

TEST(FigureText, IsEmptyBehindTheText) {
  EXPECT_EQ(DecimalAt("A = 1", 1, 6), "");
  EXPECT_EQ(DecimalAt("A = 1", 2, 1), "");
  EXPECT_EQ(DecimalAt("A = 1", 0, 1), "");
}

const Device::FigureSource& SourceOf(const DeviceFile& file, std::string_view keyword) {
  return file.grades.front().figure_sources.at(*Device::FindKeyword(keyword));
}

TEST(FigureSource, OfEveryWayToWriteANumber) {
  const DeviceFile file = DeviceFile::Parse(
      "\xef\xbb\xbf" "description = \"\"\"two\r\nlines \xc3\xbc\"\"\"\n"
      "device = 'dev'\npackages = ['p']\n"
      "[grade]\r\n"
      "\"\\u0031\" = {VCOCLK_FREQ_MIN = +4E+2, VCOCLK_FREQ_MAX=1_080.250,O_MAX_HT_LT = 0x4_0}\n"
      "[grade.2]\n"
      "\tO_MAX_HT_LT\t=\t0o100\n"
      "\"CLKPFD_FREQ_MIN\" = 0b10_011 # nineteen\n"
      "'CLKPFD_FREQ_MAX' = 1234567890.12345678901234567890e-7\n",
      "dev.toml", "dev");
  EXPECT_EQ(SourceOf(file, "VCOCLK_FREQ_MIN").decimal, "4e2");
  EXPECT_EQ(SourceOf(file, "VCOCLK_FREQ_MIN").position, (Device::SourcePosition{6, 31}));
  EXPECT_EQ(SourceOf(file, "VCOCLK_FREQ_MAX").decimal, "1080.250");
  EXPECT_EQ(SourceOf(file, "O_MAX_HT_LT").decimal, "64");
  EXPECT_EQ(SourceOf(file, "CLKPFD_FREQ_MIN").decimal, "");
  const auto& second = file.grades.at(1).figure_sources;
  EXPECT_EQ(second.at(*Device::FindKeyword("O_MAX_HT_LT")).decimal, "64");
  EXPECT_EQ(second.at(*Device::FindKeyword("O_MAX_HT_LT")).position,
            (Device::SourcePosition{8, 16}));
  EXPECT_EQ(second.at(*Device::FindKeyword("CLKPFD_FREQ_MIN")).decimal, "19");
  EXPECT_EQ(second.at(*Device::FindKeyword("CLKPFD_FREQ_MAX")).decimal,
            "1234567890.12345678901234567890e-7");
}

// The decimals are the figures: strtod reads the same doubles from them.
TEST(FigureSource, OfTheBundledDevices) {
  int figures = 0;
  const auto catalogue = Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES});
  for (const std::string& device : catalogue.Names()) {
    const DeviceFile file = DeviceFile::Read(*catalogue.FindFile(device), device);
    for (const Device::Grade& grade : file.grades) {
      ASSERT_EQ(grade.figure_sources.size(), grade.figures.size());
      for (std::size_t i = 0; i < grade.figures.size(); ++i) {
        const std::string& decimal = grade.figure_sources[i].decimal;
        EXPECT_EQ(decimal.empty(), !grade.figures[i].has_value());
        if (!grade.figures[i]) continue;
        EXPECT_EQ(std::strtod(decimal.c_str(), nullptr), *grade.figures[i]) << decimal;
        ++figures;
      }
    }
  }
  EXPECT_GT(figures, 80);
}

}  // namespace

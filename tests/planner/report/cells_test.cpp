#include "planner/report/Cells.h"

#include <gmock/gmock.h>

#include "made.h"

namespace planner::report {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

TEST(Cells, FiguresOfAnAnswer) {
  const Request request = MadeRequest({100}, {Rational(297, 2)});
  Answer answer = MadeLoop(request, Primitive::kTsyn, Bandwidth::kLow, 499, 7, {48}, 189.2);
  EXPECT_EQ(BandwidthCell(answer), "LOW");
  EXPECT_EQ(VcoCell(answer), "891.071");  // 100 x 62.375 / 7
  EXPECT_EQ(PpmCell(answer), "80.17");    // 891.0714 / 6 is 148.511905
  EXPECT_EQ(JitterCell(answer.max_jitter), "189.200");
  EXPECT_EQ(JitterCell(std::nullopt), "-");
  answer.worst_ppm = 12345678;
  EXPECT_EQ(PpmCell(answer), "1.23e+07");
}

TEST(Cells, ThereAreNoneOfAnUnsolvedAnswer) {
  const Answer answer = Refused(Primitive::kPll, "No.");
  EXPECT_EQ(BandwidthCell(answer) + VcoCell(answer) + PpmCell(answer) + SourceCell(answer), "----");
}

TEST(Cells, AKruHasNeitherVcoNorBandwidth) {
  const Answer answer = MadeKru(MadeRequest({100}, {100}), {.pins = {Pin::kClk0}}, {1}, 180);
  EXPECT_EQ(BandwidthCell(answer) + VcoCell(answer), "--");
}

TEST(Cells, WhereSettingsComeFrom) {
  const Request request = VideoRequest();
  Answer answer = VideoAnswer(request);
  EXPECT_EQ(SourceCell(answer), "search");
  answer.source.engine = true;
  EXPECT_EQ(SourceCell(answer), "both");
  answer.source.search = false;
  EXPECT_EQ(SourceCell(answer), "engine");
}

TEST(Cells, WhatIsOff) {
  const Request request = VideoRequest();
  Answer answer = VideoAnswer(request);
  EXPECT_THAT(OffWords(answer), IsEmpty());
  Miss(&answer, 2, Quantity::kDuty, 9, 1);
  Miss(&answer, 0, Quantity::kPhase, 9, 1);
  Miss(&answer, 1, Quantity::kPhase, 9, 1);
  EXPECT_THAT(OffWords(answer), ElementsAre("phase", "duty"));
  Miss(&answer, 0, Quantity::kJitter, 9, 1);
  Miss(&answer, 0, Quantity::kFrequency, 9, 1);
  Break(&answer, Outside(Quantity::kVco, -1, 0, 9, {1, 2}));
  EXPECT_THAT(OffWords(answer), ElementsAre("frequency", "phase", "duty", "jitter", "range"));
}

const std::vector<MarkedRow> kRows = {{"1", {"1"}, "", "fine", {}},
                                      {"2", {"2"}, "", "", {"phase"}},
                                      {"3", {"3"}, "best, but ", "", {"frequency", "range"}},
                                      {"4", {"4"}, "", "", {"phase"}}};

TEST(Cells, MarksSayWhatIsOff) {
  EXPECT_EQ(MarkedTable({}, {{Align::kRight, "#"}}, "off", kRows),
            "#  off\n"
            "1  fine\n"
            "2  phase OFF\n"
            "3  best, but frequency and range OFF\n"
            "4  phase OFF\n");
}

TEST(Cells, WithoutRoomALineBelowSaysIt) {
  EXPECT_EQ(MarkedTable({.width = 35}, {{Align::kRight, "#"}}, "off", kRows),
            "#  off\n"
            "1  fine\n"
            "2  OFF\n"
            "3  best, but OFF\n"
            "4  OFF\n"
            "OFF: phase of 2 and 4; frequency\n"
            "  and range of 3\n");
}

TEST(Cells, RowsThatFollowEachOtherAreToldTogether) {
  std::vector<MarkedRow> rows;
  for (const char* name : {"1", "2", "3", "4", "5", "6"}) {
    rows.push_back({name, {name}, "", "", {std::string(name) == "4" ? "range" : "phase"}});
  }
  EXPECT_EQ(MarkedTable({.width = 10}, {{Align::kRight, "#"}}, "off", rows).substr(49),
            "OFF:\n  phase of\n  1 to 3,\n  5 and 6;\n  range of\n  4\n");
}

TEST(Cells, TheBestIsColouredAndTheMarksOfTheOthers) {
  EXPECT_EQ(MarkedTable({.colour = true}, {{Align::kRight, "#"}}, "off", {kRows[0], kRows[1]}),
            "\033[1m#  off\033[0m\n"
            "\033[32m1  fine\033[0m\n"
            "2  \033[31m\033[1mphase OFF\033[0m\n");
}

}  // namespace
}  // namespace planner::report

// Lines and rows of a batch, of outcomes that are made by hand.
#include "planner/report/BatchText.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "made.h"

namespace planner::report {
namespace {

using batch::Outcome;
using batch::Status;
using batch::Trouble;
using nlohmann::ordered_json;

Outcome Made(Status status) {
  Outcome outcome;
  outcome.line = 17;
  outcome.digest = 0xf1e2;
  outcome.status = status;
  outcome.device = std::make_shared<const Device>(MadeDevice());
  return outcome;
}

read::Node Id(read::NodeType type, const std::string& text) {
  read::Node id;
  id.type = type;
  id.text = text;
  return id;
}

Outcome Planned() {
  Outcome outcome = Made(Status::kWithin);
  outcome.id = Id(read::NodeType::kString, "v, \"w\"");
  plan::Plan plan;
  plan.request = VideoRequest();
  plan.ranked = {VideoAnswer(plan.request)};
  outcome.plan = plan;
  return outcome;
}

Outcome Wrong(Trouble trouble) {
  Outcome outcome = Made(Status::kWrong);
  outcome.trouble = trouble;
  return outcome;
}

ordered_json ErrorsOf(const Outcome& outcome) {
  return ordered_json::parse(BatchLines(outcome, {.longest = 99}))["errors"];
}

TEST(BatchLines, BeginWithWhatARunGoesOnBy) {
  const std::string head = R"({"line":17,"digest":"000000000000f1e2","status":)";
  EXPECT_EQ(BatchLines(Wrong(Trouble::kNone), {}),
            head + R"("wrong","primitive":null,"id":null,"errors":[]})" + "\n");
  const std::string line = BatchLines(Planned(), {});
  const std::string begin = head + R"("within","primitive":"TSYN","id":"v, \"w\"","plan":{)";
  EXPECT_EQ(line.substr(0, begin.size()), begin);
  EXPECT_EQ(line.find('\n'), line.size() - 1);
}

TEST(BatchLines, ANumberComesBackAsItWasWritten) {
  Outcome outcome = Wrong(Trouble::kNone);
  outcome.id = Id(read::NodeType::kNumber, "1.50e3");
  EXPECT_NE(BatchLines(outcome, {}).find(R"("id":1.50e3,)"), std::string::npos);
}

TEST(BatchLines, ThePlanHasTheBestOrAll) {
  Outcome outcome = Planned();
  outcome.plan->ranked.push_back(outcome.plan->ranked.front());
  EXPECT_EQ(ordered_json::parse(BatchLines(outcome, {}))["plan"]["answers"].size(), 1u);
  EXPECT_EQ(ordered_json::parse(BatchLines(outcome, {.all = true}))["plan"]["answers"].size(), 2u);
}

TEST(BatchLines, WhatHasNoSettingsHasReasons) {
  Outcome outcome = Made(Status::kUnsolved);
  outcome.plan.emplace();
  outcome.plan->refused = {Refused(Primitive::kPll, "no VCO")};
  const ordered_json line = ordered_json::parse(BatchLines(outcome, {}));
  ASSERT_EQ(line["reasons"].size(), 1u);
  EXPECT_EQ(line["reasons"][0]["primitive"], "PLL");
  EXPECT_FALSE(line.contains("errors"));
}

TEST(BatchLines, SayWhatIsWrong) {
  EXPECT_EQ(ErrorsOf(Wrong(Trouble::kTooLong)),
            ordered_json::parse(
                R"([{"kind": "too_long", "message": "the line is longer than 99 bytes"}])"));
  Outcome outcome = Wrong(Trouble::kNoPrimitive);
  EXPECT_EQ(ErrorsOf(outcome), ordered_json::parse(R"([{"kind": "no_primitive",
      "message": "vk40b484-2 has the limits of no primitive"}])"));
  outcome.lacking = Primitive::kPll;
  EXPECT_EQ(ErrorsOf(outcome), ordered_json::parse(R"([{"kind": "no_primitive",
      "message": "vk40b484-2 has no PLL; it has PLL, TSYN, KRU_SP, KRU_CLKGEN"}])"));
}

TEST(BatchLines, SayWhereInTheLine) {
  Outcome outcome = Wrong(Trouble::kNone);
  read::Mistake mistake;
  mistake.kind = read::MistakeKind::kMissing;
  mistake.place = {"b.jsonl", 17, 8, "inputs", -1, ""};
  outcome.mistakes = {mistake};
  outcome.part.emplace(device::PartError::Kind::kUnknownDevice);
  outcome.part->name = "vk4";
  ordered_json errors = ErrorsOf(outcome);
  ASSERT_EQ(errors.size(), 2u);
  EXPECT_EQ(errors[0]["kind"], "missing");
  EXPECT_EQ(errors[0]["column"], 8);
  EXPECT_EQ(errors[1]["kind"], "unknown_device");

  // Of the line as a whole.
  outcome.mistakes[0].place.column = 0;
  EXPECT_FALSE(ErrorsOf(outcome)[0].contains("column"));
}

TEST(BatchLines, SayWhyTheProgramHasFailed) {
  Outcome outcome = Made(Status::kFailed);
  outcome.failure = DiedText();
  EXPECT_EQ(ErrorsOf(outcome), ordered_json::parse(R"([{"kind": "failed", "message":
      "the process that worked on the line has died, and so has one that worked on nothing else"
      }])"));
}

// --- For spreadsheets -------------------------------------------------------------------

constexpr BatchForm kCsv = {.csv = true, .longest = 99};

TEST(BatchRows, TheHeadingNamesTheColumns) {
  EXPECT_EQ(BatchHeading({}), "");
  EXPECT_EQ(BatchHeading(kCsv),
            "line,id,status,number,device,primitive,bandwidth,m,d,vco,output,divider,pin,"
            "requested,actual,error_ppm,phase,phase_error,duty,duty_error,jitter,within,message"
            "\r\n");
}

TEST(BatchRows, ARowForEachOutputThatIsUsed) {
  Outcome outcome = Planned();
  outcome.plan->ranked[0].outputs[1].used = false;
  const std::string first = R"(17,"v, ""w""",within,1,vk40b484-2,TSYN,HIGH,44,1,1188,)";
  EXPECT_EQ(BatchLines(outcome, kCsv),
            first + "0,8,,148.5,148.5,0,0,,50,,128.815,true,\r\n" + first +
                "2,44,,27,27,0,0,,50,,128.815,true,\r\n");
}

TEST(BatchRows, OfTheBestOrOfAll) {
  Outcome outcome = Planned();
  outcome.plan->request.outputs.resize(1);
  outcome.plan->ranked[0].outputs.resize(1);
  outcome.plan->ranked.push_back(outcome.plan->ranked.front());
  outcome.id.reset();
  const std::string end = ",vk40b484-2,TSYN,HIGH,44,1,1188,0,8,,148.5,148.5,0,0,,50,,128.815,true,";
  EXPECT_EQ(BatchLines(outcome, kCsv), "17,,within,1" + end + "\r\n");
  EXPECT_EQ(BatchLines(outcome, {.csv = true, .all = true}),
            "17,,within,1" + end + "\r\n17,,within,2" + end + "\r\n");
}

// Pins in place of dividers; and CLK0 needs no M and D.
TEST(BatchRows, OfAKru) {
  Outcome outcome = Made(Status::kWithin);
  plan::Plan plan;
  plan.request = MadeRequest({27}, {27, 81});
  KruSettings settings;
  settings.pins = {hardware::Pin::kClk0, hardware::Pin::kClkfx};
  settings.m = 3;
  settings.d = 1;
  plan.ranked = {MadeKru(plan.request, settings, {1, 3}, std::nullopt)};
  outcome.plan = plan;
  EXPECT_EQ(BatchLines(outcome, kCsv),
            "17,,within,1,vk40b484-2,KRU_SP,,3,1,,0,,CLK0,27,27,0,0,,50,,,true,\r\n"
            "17,,within,1,vk40b484-2,KRU_SP,,3,1,,1,,CLKFX,81,81,0,0,,50,,,true,\r\n");

  settings.pins = {hardware::Pin::kClk0, hardware::Pin::kClk0};
  settings.m = settings.d = 0;
  outcome.plan->ranked = {MadeKru(outcome.plan->request, settings, {1, 1}, std::nullopt)};
  EXPECT_EQ(BatchLines(outcome, kCsv).substr(0, 50),
            "17,,within,1,vk40b484-2,KRU_SP,,,,,0,,CLK0,27,27,0");
}

// Two sentences, in the first row only.
TEST(BatchRows, LimitsThatAreBrokenAreToldOnce) {
  Outcome outcome = Planned();
  Answer& answer = outcome.plan->ranked[0];
  answer.outputs.resize(2);
  outcome.plan->request.outputs.resize(2);
  Break(&answer, Outside(Quantity::kVco, -1, 0, 1620, {600, 1440}));
  Break(&answer, Outside(Quantity::kPfd, -1, 0, 5, {10, 500}));
  const std::string rows = BatchLines(outcome, kCsv);
  const std::size_t end = rows.find("\r\n");
  ASSERT_NE(end, std::string::npos);
  EXPECT_NE(rows.substr(0, end).find("; "), std::string::npos) << rows;
  EXPECT_NE(rows.substr(0, end).find("1620"), std::string::npos) << rows;
  EXPECT_EQ(rows.find("1620", end), std::string::npos) << rows;
}

TEST(BatchRows, WhatHasNoPlanHasOneRow) {
  EXPECT_EQ(BatchLines(Wrong(Trouble::kTooLong), kCsv),
            "17,,wrong,,vk40b484-2,,,,,,,,,,,,,,,,,,the line is longer than 99 bytes\r\n");
  Outcome outcome = Wrong(Trouble::kTooLong);
  outcome.device.reset();
  EXPECT_EQ(BatchLines(outcome, kCsv),
            "17,,wrong,,,,,,,,,,,,,,,,,,,,the line is longer than 99 bytes\r\n");

  outcome = Made(Status::kUnsolved);
  outcome.plan.emplace();
  outcome.plan->refused = {Refused(Primitive::kPll, "no VCO"), Refused(Primitive::kTsyn, "no D")};
  const std::string row = BatchLines(outcome, kCsv);
  EXPECT_NE(row.find("PLL: "), std::string::npos) << row;
  EXPECT_NE(row.find("; TSYN: "), std::string::npos) << row;
}

// --- The table at the end ---------------------------------------------------------------

TEST(BatchSummary, CountsByStatusAndPrimitive) {
  batch::Counts counts;
  counts.Add(1, Status::kWithin, Primitive::kTsyn);
  counts.Add(2, Status::kOff, Primitive::kPll);
  counts.Add(3, Status::kOff, Primitive::kTsyn);
  counts.Add(4, Status::kWrong, std::nullopt);
  EXPECT_EQ(BatchSummary(counts, {}),
            "status    requests  PLL  TSYN  first line\n"
            "within           1    -     1\n"
            "off              2    1     1           2\n"
            "unsolved         0    -     -           -\n"
            "wrong            1    -     -           4\n"
            "all              4    1     2\n");
  // The program hardly ever fails.
  counts.Add(5, Status::kFailed, std::nullopt);
  EXPECT_NE(BatchSummary(counts, {}).find("failed           1    -     -           5\n"),
            std::string::npos);
}

}  // namespace
}  // namespace planner::report

#include "planner/batch/Answerer.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <utility>

#include "host/bundled/device/DeviceCatalogue.h"
#include "planner/device/Files.h"
#include "planner/read/MistakeText.h"
#include "planner/read/Options.h"

namespace planner::batch {
namespace {

// The bundled devices, and how often one was read.
class Counting final : public device::Files {
 public:
  std::vector<std::string> Names() const override { return files_->Names(); }
  std::string PathOf(std::string_view name) const override { return files_->PathOf(name); }
  std::string TextOf(std::string_view name) const override {
    ++reads_;
    return files_->TextOf(name);
  }
  int reads() const { return reads_; }

 private:
  std::unique_ptr<const device::Files> files_ =
      device::HostFiles(::Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES}));
  mutable int reads_ = 0;
};

class AnswererTest : public testing::Test {
 protected:
  Outcome Answer(std::string text, std::int64_t number = 7) {
    Line line;
    line.number = number;
    line.digest = 99;
    line.text = std::move(text);
    return answerer_.Answer(line);
  }
  // The sentences about a line that is wrong.
  std::vector<std::string> Sentences(const std::string& text) {
    const Outcome outcome = Answer(text);
    EXPECT_EQ(outcome.status, Status::kWrong);
    EXPECT_FALSE(outcome.plan);
    std::vector<std::string> sentences;
    for (const read::Mistake& mistake : outcome.mistakes) sentences.push_back(TextOf(mistake));
    return sentences;
  }

  Counting files_;
  Answerer answerer_{{"some.jsonl", {}, "vk40"}, files_};
};

using Strings = std::vector<std::string>;

TEST_F(AnswererTest, PlanOfALine) {
  const Outcome outcome = Answer(R"({"inputs": [27], "outputs": [148.5, 74.25, 27]})");
  EXPECT_EQ(outcome.status, Status::kWithin);
  EXPECT_EQ(outcome.line, 7);
  EXPECT_EQ(outcome.digest, 99u);
  EXPECT_FALSE(outcome.id);
  ASSERT_TRUE(outcome.plan);
  EXPECT_EQ(outcome.Best(), Primitive::kTsyn);
  EXPECT_EQ(outcome.device->part, "vk40b484-2");
  // 27 x 44 is 1188, which 8 divides to 148.5.
  const auto& settings = std::get<LoopSettings>(outcome.plan->ranked.front().settings);
  EXPECT_EQ(settings.m, 44 * 8);
  EXPECT_EQ(settings.outputs.front().divider, 8 * 8);
}

TEST_F(AnswererTest, Ids) {
  EXPECT_EQ(Answer(R"({"id": "a\nb", "inputs": [27], "outputs": [27]})").id->text, "a\nb");
  const Outcome number = Answer(R"({"inputs": [27], "outputs": [27], "id": 1.50e3})");
  EXPECT_EQ(number.id->type, read::NodeType::kNumber);
  EXPECT_EQ(number.id->text, "1.50e3");
  EXPECT_FALSE(Answer(R"({"id": null, "inputs": [27], "outputs": [27]})").id);
  // It is known also of a request that is wrong.
  EXPECT_EQ(Answer(R"({"id": "x", "inputs": 27})").id->text, "x");
  EXPECT_EQ(Sentences(R"({"id": [1], "inputs": [27], "outputs": [27]})"),
            (Strings{"some.jsonl:7:8: id must be a text in quotes or a number, not an array"}));
}

// 333 MHz from 100 take a multiple of 333 for an M, which goes to 64; and 1 kHz is below the PFD of
// every loop.
TEST_F(AnswererTest, StatusOfWhatIsNotWithin) {
  EXPECT_EQ(Answer(R"({"inputs": [100], "outputs": [333], "primitive": "PLL", "exact": true})")
                .status,
            Status::kOff);
  const Outcome outcome = Answer(R"({"inputs": [0.001], "outputs": [27], "primitive": "PLL"})");
  EXPECT_EQ(outcome.status, Status::kUnsolved);
  ASSERT_TRUE(outcome.plan);
  EXPECT_EQ(outcome.plan->refused.size(), 1u);
  EXPECT_FALSE(outcome.Best());
}

TEST_F(AnswererTest, MistakesHaveTheLineOfTheBatch) {
  EXPECT_EQ(Sentences("nonsense"),
            (Strings{"some.jsonl:7:1: no valid JSON: a value must be here, not \"nonsense\""}));
  EXPECT_EQ(Sentences("{}"), (Strings{"some.jsonl:7: the request has no inputs",
                                      "some.jsonl:7: the request has no outputs"}));
  EXPECT_EQ(Sentences(R"({"inputs": [27], "outputs": [27], "rank": "best"})").size(), 1u);
  EXPECT_EQ(Sentences(std::string("{\"id\": 1}\0", 10)).size(), 1u);
  EXPECT_EQ(Sentences("{\"id\": \"\xff\"}"),
            (Strings{"some.jsonl:7:9: no valid JSON: the text is not UTF-8 here"}));
}

TEST_F(AnswererTest, TooLong) {
  Line line;
  line.number = 1;
  line.is_too_long = true;
  line.text = R"({"inputs": [27], "outputs": [27]})";
  const Outcome outcome = answerer_.Answer(line);
  EXPECT_EQ(outcome.status, Status::kWrong);
  EXPECT_EQ(outcome.trouble, Trouble::kTooLong);
}

TEST_F(AnswererTest, DevicesThatThereAreNot) {
  const Outcome unknown = Answer(R"({"inputs": [27], "outputs": [27], "device": "vk99"})");
  EXPECT_EQ(unknown.status, Status::kWrong);
  ASSERT_TRUE(unknown.part);
  EXPECT_EQ(unknown.part->kind, device::PartError::Kind::kUnknownDevice);
  // vk20 has a TSYN alone.
  const Outcome lacking =
      Answer(R"({"inputs": [27], "outputs": [27], "device": "vk20", "primitive": "PLL"})");
  EXPECT_EQ(lacking.status, Status::kWrong);
  EXPECT_EQ(lacking.trouble, Trouble::kNoPrimitive);
  EXPECT_EQ(lacking.lacking, Primitive::kPll);
}

TEST_F(AnswererTest, ADeviceIsReadOnce) {
  Answer(R"({"inputs": [27], "outputs": [27]})");
  const int reads = files_.reads();
  EXPECT_GT(reads, 0);
  for (int i = 0; i < 5; ++i) Answer(R"({"inputs": [25], "outputs": [25], "device": "vk40"})");
  EXPECT_EQ(files_.reads(), reads);
  Answer(R"({"inputs": [25], "outputs": [25], "device": "vk20"})");
  EXPECT_GT(files_.reads(), reads);
}

TEST_F(AnswererTest, OptionsReplaceWhatALineSays) {
  read::Mistakes mistakes;
  const std::vector<read::Option> options = {{"--primitive", "PLL"}, {"--device", "vk10"}};
  Answerer answerer({"some.jsonl", read::ReadOptions(options, &mistakes), "vk40"}, files_);
  Line line;
  line.text = R"({"inputs": [27], "outputs": [27], "primitive": "TSYN", "device": "vk20"})";
  const Outcome outcome = answerer.Answer(line);
  EXPECT_EQ(outcome.Best(), Primitive::kPll);
  EXPECT_EQ(outcome.device->name, "vk10");
}

// What nobody has foreseen, as a file that cannot be read any more for want of memory.
class Failing final : public device::Files {
 public:
  std::vector<std::string> Names() const override { return {"vk40"}; }
  std::string PathOf(std::string_view) const override { return "vk40.toml"; }
  std::string TextOf(std::string_view) const override { throw std::runtime_error("no memory"); }
};

TEST(Answerer, AFailureIsAnOutcome) {
  const Failing files;
  Answerer answerer({"some.jsonl", {}, "vk40"}, files);
  Line line;
  line.number = 3;
  line.text = R"({"inputs": [27], "outputs": [27]})";
  const Outcome outcome = answerer.Answer(line);
  EXPECT_EQ(outcome.status, Status::kFailed);
  EXPECT_EQ(outcome.failure, "no memory");
  EXPECT_EQ(outcome.line, 3);
  EXPECT_FALSE(outcome.plan);
}

TEST(Counts, AreByStatusAndPrimitive) {
  Counts counts;
  counts.Add(3, Status::kOff, Primitive::kPll);
  counts.Add(4, Status::kOff, Primitive::kTsyn);
  counts.Add(5, Status::kWrong, {});
  EXPECT_EQ(counts.Of(Status::kOff), 2);
  EXPECT_EQ(counts.Of(Status::kWithin), 0);
  EXPECT_EQ(counts.All(), 3);
  EXPECT_EQ(counts.first[static_cast<std::size_t>(Status::kOff)], 3);
}

}  // namespace
}  // namespace planner::batch

#include "planner/batch/Resumed.h"

#include <gtest/gtest.h>

#include <string>

namespace planner::batch {
namespace {

const std::string kText =
    R"({"line":17,"digest":"00f1e2d3c4b5a697","status":"within","primitive":"TSYN")";
const Head kHead = {17, 0x00f1e2d3c4b5a697, Status::kWithin, Primitive::kTsyn};

TEST(Head, IsWrittenAndRead) {
  EXPECT_EQ(TextOf(kHead), kText);
  EXPECT_EQ(ReadHead(kText + ",\"id\":7}"), kHead);
  for (const Status status : kStatuses) {
    for (const Primitive primitive : hardware::kPrimitives) {
      const Head head = {1, ~std::uint64_t{0}, status, primitive};
      EXPECT_EQ(ReadHead(TextOf(head) + ","), head);
      EXPECT_LE(TextOf(head).size() + 20, kMostOfHead);  // and longer numbers
    }
    const Head head = {123456789012345678, 0, status, {}};
    EXPECT_EQ(ReadHead(TextOf(head) + ","), head);
  }
}

TEST(Head, IsNothingElse) {
  EXPECT_FALSE(ReadHead(""));
  // Cut anywhere.
  for (std::size_t size = 0; size <= kText.size(); ++size) {
    EXPECT_FALSE(ReadHead(kText.substr(0, size))) << size;
  }
  // A letter that is another one, but for the digits of numbers.
  for (std::size_t i = 0; i < kText.size(); ++i) {
    std::string other = kText + ",";
    if (other[i] >= '0' && other[i] <= '9') continue;
    if (i >= 21 && i < 37) continue;  // the digest
    other[i] = '#';
    EXPECT_FALSE(ReadHead(other)) << other;
  }
  std::string other = kText + ",";
  EXPECT_FALSE(ReadHead(other.replace(8, 2, "-7")));
  other = kText + ",";
  EXPECT_FALSE(ReadHead(other.replace(8, 2, "1234567890123456789")));
  other = kText + ",";
  EXPECT_FALSE(ReadHead(other.replace(21, 16, "00F1e2d3c4b5a697")));
}

}  // namespace
}  // namespace planner::batch

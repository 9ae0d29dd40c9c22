// Frequencies in reach, as text, JSON and rows, of a device that has few.
#include "planner/report/ReachText.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "made.h"

namespace planner::report {
namespace {

using nlohmann::ordered_json;
using Kind = ReachQuestion::Kind;

// A PLL that has no other VCO than 27 MHz times 44, which is 1188 MHz. Divided by 8, 7 and 6 that is
// 148.5, 169.714286 and 198 MHz; by 5 and by 9 it is out of the range of outputs.
class ReachText : public testing::Test {
 protected:
  ReachText() : device_(MadeDevice()), request_(MadeRequest({27}, {})) {
    device_.primitives = {Primitive::kPll};
    device_.has_loop_jitter = false;
    device_.pll = LoopLimits{{1188, 1188}, {27, 27}, {27, 27}, {140, 200}, {140, 200}, 64, 0};
    request_.bandwidth = Bandwidth::kHigh;
  }

  std::string Written(const ReachQuestion& question, ReachForm form) {
    std::string text;
    found_ = WriteReach(request_, device_, question, {Primitive::kPll}, form,
                        [&](const std::string& piece) {
                          text += piece;
                          return true;
                        });
    return text;
  }
  ordered_json Json(const ReachQuestion& question) {
    return ordered_json::parse(Written(question, ReachForm::kJson))["primitives"][0];
  }

  Device device_;
  Request request_;
  std::int64_t found_ = 0;
};

TEST_F(ReachText, AListAsText) {
  EXPECT_EQ(Written({}, ReachForm::kText),
            "vk40b484-2, output 0 from 27 MHz\n"
            "\n"
            "PLL\n"
            "          MHz      x input      M  D divider bandwidth jitter ps\n"
            "   148.500000         11/2     44  1       8      HIGH         -\n"
            "   169.714286         44/7     44  1       7      HIGH         -\n"
            "   198.000000         22/3     44  1       6      HIGH         -\n"
            "3 frequencies\n");
  EXPECT_EQ(found_, 3);
}

TEST_F(ReachText, ThePartOfAListThatIsShown) {
  const std::string text = Written({.most = 1}, ReachForm::kText);
  EXPECT_NE(text.find("148.5"), std::string::npos);
  EXPECT_EQ(text.find("169.7"), std::string::npos);
  EXPECT_NE(text.find("\n1 of 3 frequencies; --most 0 shows all, --count only counts\n"),
            std::string::npos);
  EXPECT_EQ(found_, 3);

  const ordered_json json = Json({.most = 2});
  EXPECT_EQ(json["frequencies"].size(), 2u);
  EXPECT_EQ(json["count"], 3);
  EXPECT_EQ(json["left_out"], 1);
}

TEST_F(ReachText, ARangeAndWhatIsNotInIt) {
  const std::string one = Written({.from = 150, .to = 170}, ReachForm::kText);
  EXPECT_EQ(one.substr(0, one.find('\n')),
            "vk40b484-2, output 0 from 27 MHz, from 150 MHz on, up to 170 MHz");
  EXPECT_NE(one.find("\n1 frequency\n"), std::string::npos);
  const std::string none = Written({.from = 199}, ReachForm::kText);
  EXPECT_EQ(none.substr(none.find("\n\n")), "\n\nPLL\nno frequencies\n");
  EXPECT_EQ(found_, 0);
}

TEST_F(ReachText, ListsAsJsonAndRows) {
  const ordered_json json = Json({.from = 190});
  EXPECT_EQ(json, ordered_json::parse(R"({"primitive": "PLL", "frequencies": [
      {"frequency": 198.0, "frequency_exact": "198", "multiply": 22, "divide": 3, "vco": 1188.0,
       "vco_exact": "1188", "bandwidth": "HIGH", "m": 44, "m_eighths": 352, "d": 1, "divider": 6,
       "divider_eighths": 48, "jitter": null}], "count": 1, "left_out": 0})"));
  EXPECT_EQ(Written({.from = 190}, ReachForm::kCsv),
            "primitive,frequency,frequency_exact,multiply,divide,vco,bandwidth,m,d,divider,pin,"
            "feedback,clkin_divide_by_2,clkdv,jitter\r\n"
            "PLL,198,198,22,3,1188,HIGH,44,1,6,,,,,\r\n");
}

TEST_F(ReachText, Counts) {
  EXPECT_EQ(Written({.kind = Kind::kCount}, ReachForm::kText),
            "vk40b484-2, output 0 from 27 MHz\n"
            "\n"
            "primitive   frequencies     lowest MHz    highest MHz\n"
            "PLL                   3     148.500000     198.000000\n");
  EXPECT_EQ(found_, 3);
  EXPECT_NE(Written({.kind = Kind::kCount, .from = 199}, ReachForm::kText)
                .find("PLL                   0              -              -\n"),
            std::string::npos);
  EXPECT_EQ(Json({.kind = Kind::kCount}),
            ordered_json::parse(R"({"primitive": "PLL", "count": 3, "lowest": 148.5,
                "lowest_exact": "297/2", "highest": 198.0, "highest_exact": "198"})"));
  EXPECT_EQ(Written({.kind = Kind::kCount, .from = 199}, ReachForm::kCsv),
            "primitive,count,lowest,highest\r\nPLL,0,,\r\n");
}

// A TSYN whose M is 44.125, so that the VCO is at 27 x 353 / 8 MHz; divided by 65 / 8 that is
// 27 x 353 / 65. One eighth more or less is out of the ranges.
TEST_F(ReachText, EighthsAreFractionsAsData) {
  device_.primitives = {Primitive::kTsyn};
  device_.tsyn = LoopLimits{{1190, 1192}, {27, 27}, {27, 27}, {146, 147}, {146, 147}, 64, 0};
  std::string text;
  const auto keep = [&](const std::string& piece) {
    text += piece;
    return true;
  };
  EXPECT_EQ(WriteReach(request_, device_, {}, {Primitive::kTsyn}, ReachForm::kJson, keep), 1);
  const ordered_json point = ordered_json::parse(text)["primitives"][0]["frequencies"][0];
  EXPECT_EQ(point["frequency_exact"], "9531/65");
  EXPECT_EQ(point["vco_exact"], "9531/8");
  EXPECT_EQ(point["m"], ordered_json(44.125));
  EXPECT_EQ(point["m_eighths"], 353);
  EXPECT_EQ(point["divider"], ordered_json(8.125));
  EXPECT_EQ(point["divider_eighths"], 65);
}

// From 1188 / 7 to 1188 / 6 is a sixth of the lower one, and from 1188 / 8 to 1188 / 7 a seventh.
TEST_F(ReachText, Gaps) {
  EXPECT_EQ(Written({.kind = Kind::kGaps, .most = 5}, ReachForm::kText),
            "vk40b484-2, output 0 from 27 MHz\n"
            "\n"
            "PLL\n"
            "    above MHz  and below MHz     wide MHz          ppm\n"
            "   169.714286     198.000000    28.285714    166666.67\n"
            "   148.500000     169.714286    21.214286    142857.14\n");
  EXPECT_EQ(found_, 2);
  EXPECT_NE(Written({.kind = Kind::kGaps, .from = 198, .most = 5}, ReachForm::kText)
                .find("\nno gaps\n"),
            std::string::npos);
  const ordered_json gap = Json({.kind = Kind::kGaps, .most = 1})["gaps"][0];
  EXPECT_EQ(gap["width_exact"], "198/7");
  EXPECT_EQ(gap["width_ppm_exact"], "500000/3");
  EXPECT_EQ(gap["below"]["divider"], 7);
  EXPECT_EQ(gap["above"]["divider"], 6);
  const std::string rows = Written({.kind = Kind::kGaps, .most = 1}, ReachForm::kCsv);
  EXPECT_EQ(rows,
            "primitive,below,above,width,width_ppm,below_exact,above_exact\r\n"
            "PLL,169.71428571428572,198,28.285714285714285,166666.66666666666,1188/7,198\r\n");
}

// 148.5 MHz are 1 percent less than 150.
TEST_F(ReachText, TheNearest) {
  const ReachQuestion question = {.kind = Kind::kNear, .near = 150, .most = 1};
  EXPECT_EQ(Written(question, ReachForm::kText),
            "vk40b484-2, output 0 from 27 MHz, nearest to 150 MHz\n"
            "\n"
            "PLL\n"
            "          MHz      x input  error ppm      M  D divider bandwidth jitter ps\n"
            "   148.500000         11/2  -10000.00     44  1       8      HIGH         -\n");
  EXPECT_EQ(found_, 1);
  const ordered_json json = Json(question)["frequencies"][0];
  EXPECT_EQ(json["error_exact"], "-3/2");
  EXPECT_EQ(json["error_ppm_exact"], "-10000");
  const std::string rows = Written(question, ReachForm::kCsv);
  EXPECT_NE(rows.find("\r\nPLL,148.5,297/2,11,2,-1.5,-10000,1188,HIGH,44,1,8,,,,,\r\n"),
            std::string::npos);
}

// CLK0 is the input, 27 MHz, and CLK2X twice that; CLKFX is too slow for all.
TEST_F(ReachText, PinsOfAKru) {
  PinLimits pins;
  for (const hardware::PinFacts& facts : hardware::kPins) {
    pins.usual[std::string(facts.limits)] = {13, 60};
    pins.doubled[std::string(facts.limits)] = {13, 60};
  }
  pins.usual["CLKFX"] = pins.doubled["CLKFX"] = {1, 2};
  device_.kru_sp = pins;
  device_.primitives = {Primitive::kKruSp};
  device_.has_kru_jitter = false;
  request_.bandwidth.reset();
  std::string text;
  const auto keep = [&](const std::string& piece) {
    text += piece;
    return true;
  };
  const ReachQuestion question = {.kind = Kind::kNear, .near = 54, .most = 1};
  EXPECT_EQ(WriteReach(request_, device_, question, {Primitive::kKruSp}, ReachForm::kText, keep), 1);
  EXPECT_NE(text.find("          MHz   x input  error ppm     pin   M   D divide / 2 feedback "
                      "jitter ps\n"
                      "    54.000000         2       0.00   CLK2X   -   -      -  -     yes "
                      "        -\n"),
            std::string::npos)
      << text;
}

TEST_F(ReachText, NoMoreIsWrittenThanIsWanted) {
  device_.pll->vco = {400, 1400};
  device_.pll->pfd = {1, 27};
  device_.pll->output = {1, 1000};
  int pieces = 0;
  const std::int64_t all =
      WriteReach(request_, device_, {}, {Primitive::kPll, Primitive::kPll}, ReachForm::kCsv,
                 [&](const std::string&) { return ++pieces < 2; });
  EXPECT_EQ(pieces, 2);
  EXPECT_GT(all, 1000);
  // Two pieces of 64 KiB, in rows of 30 to 100 bytes.
  EXPECT_LT(all, 5000);
}

TEST_F(ReachText, ADictForTcl) {
  std::string dict;
  EXPECT_EQ(WriteReachTcl(request_, device_, {.kind = Kind::kCount}, {Primitive::kPll}, &dict), 3);
  EXPECT_NE(dict.find("    primitive PLL\n    count 3\n    lowest 148.5\n"), std::string::npos)
      << dict;
}

TEST_F(ReachText, SaysThatThereIsNothing) {
  const std::vector<Primitive> two = {Primitive::kPll, Primitive::kTsyn};
  EXPECT_EQ(NothingInReachText({.output = 1, .from = 5, .to = Rational(13, 2)}, device_, two),
            "output 1 of a PLL or a TSYN of vk40b484-2 can have no frequency, from 5 MHz on, up to "
            "6.5 MHz");
  EXPECT_EQ(NothingInReachText({.kind = Kind::kGaps}, device_,
                               {Primitive::kPll, Primitive::kTsyn, Primitive::kKruSp}),
            "output 0 of a PLL, a TSYN or a KRU_SP of vk40b484-2 has not two frequencies there, "
            "between which there could be a gap");
}

}  // namespace
}  // namespace planner::report

// Tested by reach_text_test.cpp and reach.test.
#include "planner/report/ReachText.h"

#include <algorithm>
#include <cmath>
#include <nlohmann/json.hpp>
#include <utility>

#include "planner/report/Csv.h"
#include "planner/report/Data.h"
#include "planner/report/JsonText.h"
#include "planner/report/Numbers.h"
#include "planner/report/ReachData.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Table.h"
#include "planner/report/TclDict.h"

namespace planner::report {

namespace {

using nlohmann::ordered_json;
using reach::Point;
using reach::Reach;
using std::string;
using Kind = ReachQuestion::Kind;

// How one form looks. Each call writes a piece.
class Writer {
 public:
  explicit Writer(const Sink& sink) : sink_(sink) {}
  virtual ~Writer() = default;
  virtual void Begin() = 0;
  virtual void BeginPrimitive(const Reach& reach) = 0;
  virtual void AddPoint(const Reach& reach, const Point& point, const Rational* near) = 0;
  virtual void AddGap(const Reach& reach, const reach::Gap& gap) = 0;
  virtual void AddCount(const Reach& reach, const reach::Counted& counted) = 0;
  // `all`: how many there are, of which so many were shown.
  virtual void EndPrimitive(const Reach& reach, std::int64_t all, std::int64_t shown) = 0;
  virtual void End() = 0;
  bool IsWanted() const { return is_wanted_; }

 protected:
  void Put(const string& text) {
    constexpr std::size_t kPiece = 64 * 1024;
    text_ += text;
    if (text_.size() >= kPiece) Flush();
  }
  void Flush() {
    if (is_wanted_ && !text_.empty()) is_wanted_ = sink_(text_);
    text_.clear();
  }

 private:
  const Sink& sink_;
  string text_;
  bool is_wanted_ = true;
};

class CsvWriter final : public Writer {
 public:
  CsvWriter(const Request& request, const ReachQuestion& question, const Sink& sink)
      : Writer(sink), request_(request), question_(question) {}
  void Begin() override { Put(CsvRow(ReachColumns(question_.kind))); }
  void BeginPrimitive(const Reach&) override {}
  void AddPoint(const Reach& reach, const Point& point, const Rational* near) override {
    Put(CsvRow(PointCells(reach, request_, point, near)));
  }
  void AddGap(const Reach& reach, const reach::Gap& gap) override {
    Put(CsvRow(GapCells(reach, gap)));
  }
  void AddCount(const Reach& reach, const reach::Counted& counted) override {
    Put(CsvRow(CountCells(reach, counted)));
  }
  void EndPrimitive(const Reach&, std::int64_t, std::int64_t) override {}
  void End() override { Flush(); }

 private:
  const Request& request_;
  const ReachQuestion& question_;
};

class JsonWriter final : public Writer {
 public:
  JsonWriter(const Request& request, const Device& device, const ReachQuestion& question,
             const Sink& sink)
      : Writer(sink), request_(request), device_(device), question_(question) {}
  void Begin() override {
    string head = JsonText(ReachHead(request_, device_, question_));
    head.pop_back();
    Put(head + ",\"primitives\":[");
  }
  void BeginPrimitive(const Reach& reach) override {
    Put(std::exchange(is_first_primitive_, false) ? "\n" : ",\n");
    Put("{\"primitive\":\"" + string(Name(reach.primitive())) + "\"");
    if (question_.kind == Kind::kCount) return;
    Put(question_.kind == Kind::kGaps ? ",\"gaps\":[" : ",\"frequencies\":[");
    is_first_ = true;
  }
  void AddPoint(const Reach& reach, const Point& point, const Rational* near) override {
    Add(PointData(reach, request_, point, near));
  }
  void AddGap(const Reach& reach, const reach::Gap& gap) override {
    Add(GapData(reach, request_, gap));
  }
  void AddCount(const Reach& reach, const reach::Counted& counted) override {
    Put("," + JsonText(CountData(reach, counted)).substr(1));
  }
  void EndPrimitive(const Reach&, std::int64_t all, std::int64_t shown) override {
    if (question_.kind == Kind::kCount) return;
    Put("]");
    if (question_.kind == Kind::kList) {
      Put(",\"count\":" + std::to_string(all) + ",\"left_out\":" + std::to_string(all - shown));
    }
    Put("}");
  }
  void End() override {
    Put("]}\n");
    Flush();
  }

 private:
  void Add(const ordered_json& data) {
    Put(std::exchange(is_first_, false) ? "\n" : ",\n");
    Put(JsonText(data));
  }

  const Request& request_;
  const Device& device_;
  const ReachQuestion& question_;
  bool is_first_primitive_ = true;
  bool is_first_ = true;
};

// Rows with columns of a certain width, because all that is to come is not known.
class TextWriter final : public Writer {
 public:
  TextWriter(const Request& request, const Device& device, const ReachQuestion& question,
             const Sink& sink)
      : Writer(sink), request_(request), device_(device), question_(question) {}
  void Begin() override {
    string text = device_.part + ", output " + std::to_string(question_.output) + " from ";
    for (const Rational& input : request_.inputs) {
      text += (&input == &request_.inputs.front() ? "" : " and ") + Decimal(input) + " MHz";
    }
    if (question_.from) text += ", from " + Decimal(*question_.from) + " MHz on";
    if (question_.to) text += ", up to " + Decimal(*question_.to) + " MHz";
    if (question_.kind == Kind::kNear) text += ", nearest to " + Decimal(question_.near) + " MHz";
    Put(text + "\n");
    if (question_.kind == Kind::kCount) {
      Put("\n" +
          Row({{"primitive", -11}, {"frequencies", 12}, {"lowest MHz", 15}, {"highest MHz", 15}}));
    }
  }
  void BeginPrimitive(const Reach& reach) override {
    if (question_.kind == Kind::kCount) return;
    Put("\n" + string(Name(reach.primitive())) + "\n");
    has_heading_ = false;
  }
  void AddPoint(const Reach& reach, const Point& point, const Rational* near) override {
    const Rational frequency = reach.FrequencyOf(point);
    const Settings settings = reach.SettingsOf(point);
    const auto* const loop = std::get_if<LoopSettings>(&settings);
    const double jitter = reach.JitterOf(point);
    // Ratios of a KRU are short, which leaves its columns room in 80.
    const int ratio_width = loop != nullptr ? 13 : 10;
    if (!std::exchange(has_heading_, true)) {
      std::vector<Cell> heading = {{"MHz", 13}, {"x input", ratio_width}};
      if (near != nullptr) heading.push_back({"error ppm", 11});
      if (loop != nullptr) {
        heading.insert(heading.end(), {{"M", 7}, {"D", 3}, {"divider", 8}, {"bandwidth", 10}});
      } else {
        heading.insert(heading.end(), {{"pin", 8},
                                       {"M", 4},
                                       {"D", 4},
                                       {"divide", 7},
                                       {"/ 2", 3},
                                       {"feedback", 8}});
      }
      heading.push_back({"jitter ps", 10});
      Put(Row(heading));
    }
    std::vector<Cell> cells = {
        {Fixed(frequency, kFrequencyDecimals), 13},
        {point.divide == 1 ? std::to_string(point.multiply)
                           : std::to_string(point.multiply) + "/" + std::to_string(point.divide),
         ratio_width}};
    if (near != nullptr) {
      cells.push_back({Fixed((frequency - *near) / *near * 1'000'000, 2), 11});
    }
    if (loop != nullptr) {
      cells.insert(cells.end(), {{Eighths(loop->m), 7},
                                 {std::to_string(loop->d), 3},
                                 {Eighths(loop->outputs.back().divider), 8},
                                 {string(Name(loop->bandwidth)), 10}});
    } else {
      const auto& kru = std::get<KruSettings>(settings);
      const auto count = [](int number) { return number == 0 ? "-" : std::to_string(number); };
      cells.insert(cells.end(),
                   {{string(hardware::FactsOf(kru.pins.back()).name), 8},
                    {count(kru.m), 4},
                    {count(kru.d), 4},
                    {kru.divide_halves == 0 ? "-" : Short(Rational(kru.divide_halves, 2), 1), 7},
                    {kru.divide_by_2 ? "yes" : "-", 3},
                    {kru.feedback ? "yes" : "-", 8}});
    }
    cells.push_back({std::isfinite(jitter) ? Ps(jitter) : "-", 10});
    Put(Row(cells));
  }
  void AddGap(const Reach& reach, const reach::Gap& gap) override {
    const Rational below = reach.FrequencyOf(gap.below);
    const Rational above = reach.FrequencyOf(gap.above);
    const Rational width = above - below;
    if (!std::exchange(has_heading_, true)) {
      Put(Row({{"above MHz", 13}, {"and below MHz", 15}, {"wide MHz", 13}, {"ppm", 13}}));
    }
    Put(Row({{Fixed(below, kFrequencyDecimals), 13},
             {Fixed(above, kFrequencyDecimals), 15},
             {Fixed(width, kFrequencyDecimals), 13},
             {Fixed(width / below * 1'000'000, 2), 13}}));
  }
  void AddCount(const Reach& reach, const reach::Counted& counted) override {
    const auto cell = [&](const std::optional<Point>& point) {
      return point ? Fixed(reach.FrequencyOf(*point), kFrequencyDecimals) : "-";
    };
    Put(Row({{string(Name(reach.primitive())), -11},
             {std::to_string(counted.count), 12},
             {cell(counted.lowest), 15},
             {cell(counted.highest), 15}}));
  }
  void EndPrimitive(const Reach&, std::int64_t all, std::int64_t shown) override {
    if (question_.kind == Kind::kCount) return;
    if (all == 0) Put(question_.kind == Kind::kGaps ? "no gaps\n" : "no frequencies\n");
    if (question_.kind != Kind::kList || all == 0) return;
    if (shown == all) {
      Put(all == 1 ? "1 frequency\n" : std::to_string(all) + " frequencies\n");
    } else {
      Put(std::to_string(shown) + " of " + std::to_string(all) +
          " frequencies; --most 0 shows all, --count only counts\n");
    }
  }
  void End() override { Flush(); }

 private:
  struct Cell {
    string text;
    int width;  // below 0: to the left
  };
  static string Row(const std::vector<Cell>& cells) {
    string row;
    for (const auto& [text, width] : cells) {
      const auto wide = static_cast<std::size_t>(std::abs(width));
      const string blanks(wide > text.size() ? wide - text.size() : 1, ' ');
      row += width < 0 ? text + blanks : blanks + text;
    }
    // A first column to the right begins in the first column.
    return row + "\n";
  }

  const Request& request_;
  const Device& device_;
  const ReachQuestion& question_;
  bool has_heading_ = false;
};

std::size_t Most(const ReachQuestion& question) { return static_cast<std::size_t>(question.most); }

std::int64_t Tell(const Reach& reach, const ReachQuestion& question, Writer* writer) {
  const Range range = question.Within(reach);
  std::int64_t all = 0;
  std::int64_t shown = 0;
  writer->BeginPrimitive(reach);
  switch (question.kind) {
    case Kind::kCount: {
      const reach::Counted counted = Count(reach, range);
      all = counted.count;
      writer->AddCount(reach, counted);
      break;
    }
    case Kind::kGaps:
      for (const reach::Gap& gap : LargestGaps(reach, range, Most(question))) {
        writer->AddGap(reach, gap);
        all = ++shown;
      }
      break;
    case Kind::kNear:
      for (const Point& point : Nearest(reach, question.near, range, Most(question))) {
        writer->AddPoint(reach, point, &question.near);
        all = ++shown;
      }
      break;
    case Kind::kList:
      reach.ForEach(range, [&](const Point& point) {
        ++all;
        if (question.most == 0 || all <= question.most) {
          writer->AddPoint(reach, point, nullptr);
          ++shown;
        }
        return writer->IsWanted();
      });
      break;
  }
  writer->EndPrimitive(reach, all, shown);
  return all;
}

std::unique_ptr<Writer> WriterOf(const Request& request, const Device& device,
                                 const ReachQuestion& question, ReachForm form, const Sink& sink) {
  switch (form) {
    case ReachForm::kText:
      break;
    case ReachForm::kJson:
      return std::make_unique<JsonWriter>(request, device, question, sink);
    case ReachForm::kCsv:
      return std::make_unique<CsvWriter>(request, question, sink);
  }
  return std::make_unique<TextWriter>(request, device, question, sink);
}

}  // namespace

Range ReachQuestion::Within(const reach::Reach& reach) const {
  return {from.value_or(Rational(0)), to ? *to : reach.range().highest};
}

std::int64_t WriteReach(const Request& request, const Device& device, const ReachQuestion& question,
                        const std::vector<Primitive>& primitives, ReachForm form,
                        const Sink& sink) {
  const auto writer = WriterOf(request, device, question, form, sink);
  std::int64_t all = 0;
  writer->Begin();
  for (const Primitive primitive : primitives) {
    if (!writer->IsWanted()) break;
    all += Tell(Reach(request, device, primitive, question.output), question, writer.get());
  }
  writer->End();
  return all;
}

std::int64_t WriteReachTcl(const Request& request, const Device& device,
                           const ReachQuestion& question, const std::vector<Primitive>& primitives,
                           std::string* dict) {
  string text;
  const std::int64_t all =
      WriteReach(request, device, question, primitives, ReachForm::kJson, [&](const string& piece) {
        text += piece;
        return true;
      });
  *dict = TclDict(ordered_json::parse(text));
  return all;
}

std::string NothingInReachText(const ReachQuestion& question, const Device& device,
                               const std::vector<Primitive>& primitives) {
  string text = "output " + std::to_string(question.output) + " of ";
  for (std::size_t i = 0; i < primitives.size(); ++i) {
    if (i > 0) text += i + 1 == primitives.size() ? " or " : ", ";
    text += "a " + string(Name(primitives[i]));
  }
  text += " of " + device.part;
  if (question.kind == Kind::kGaps) {
    return text + " has not two frequencies there, between which there could be a gap";
  }
  text += " can have no frequency";
  if (question.from) text += ", from " + Decimal(*question.from) + " MHz on";
  if (question.to) text += ", up to " + Decimal(*question.to) + " MHz";
  return text;
}

}  // namespace planner::report

// Tested by options_test.cpp and request_json_test.cpp.
#include "planner/read/Names.h"

#include <array>
#include <string>
#include <utility>

#include "planner/read/Letters.h"

namespace planner::read {

namespace {

constexpr std::array kRanks = {Rank::kJitter, Rank::kError, Rank::kMargin, Rank::kVco};
// As messages have always listed them.
constexpr std::array kListedBandwidths = {Bandwidth::kLow, Bandwidth::kHigh, Bandwidth::kOptimized};

Mistake NotAName(std::string_view name, const Place& place, std::vector<std::string> known) {
  Mistake mistake;
  mistake.kind = MistakeKind::kNotAName;
  mistake.place = place;
  mistake.text = name;
  mistake.known = std::move(known);
  return mistake;
}

}  // namespace

Entry<std::optional<Primitive>> ReadPrimitive(std::string_view name, const Place& place,
                                              Mistakes* mistakes) {
  const std::string text(name);
  if (IsSameWord(name, "auto")) return {{std::nullopt, place, text}};
  std::vector<std::string> known = {"auto"};
  for (const Primitive primitive : hardware::kPrimitives) {
    if (IsSameWord(name, Name(primitive))) return {{primitive, place, text}};
    known.emplace_back(Name(primitive));
  }
  mistakes->push_back(NotAName(name, place, std::move(known)));
  return std::nullopt;
}

Entry<Bandwidth> ReadBandwidth(std::string_view name, const Place& place, Mistakes* mistakes) {
  std::vector<std::string> known;
  for (const Bandwidth bandwidth : kListedBandwidths) {
    if (IsSameWord(name, Name(bandwidth))) return {{bandwidth, place, std::string(name)}};
    known.emplace_back(Name(bandwidth));
  }
  mistakes->push_back(NotAName(name, place, std::move(known)));
  return std::nullopt;
}

Entry<Rank> ReadRank(std::string_view name, const Place& place, Mistakes* mistakes) {
  std::vector<std::string> known;
  for (const Rank rank : kRanks) {
    if (IsSameWord(name, NameOf(rank))) return {{rank, place, std::string(name)}};
    known.emplace_back(NameOf(rank));
  }
  mistakes->push_back(NotAName(name, place, std::move(known)));
  return std::nullopt;
}

std::string_view NameOf(Rank rank) {
  switch (rank) {
    case Rank::kError:
      return "error";
    case Rank::kMargin:
      return "margin";
    case Rank::kVco:
      return "vco";
    case Rank::kJitter:
      break;
  }
  return "jitter";
}

}  // namespace planner::read

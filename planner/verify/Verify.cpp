// Tested by verify_test.cpp and mutation_test.cpp.
#include "planner/verify/Verify.h"

#include <algorithm>
#include <cstddef>
#include <nlohmann/json.hpp>
#include <utility>

#include "planner/PlanVersion.h"
#include "planner/read/JsonTree.h"
#include "planner/verify/Claim.h"
#include "planner/verify/Difference.h"
#include "planner/verify/Entries.h"
#include "planner/verify/ReadRequest.h"
#include "planner/verify/Sequence.h"
#include "planner/verify/Standing.h"

namespace planner::verify {

namespace {

using nlohmann::ordered_json;
using read::Node;
using read::NodeType;
using std::string;

// The source of settings of the user's own.
constexpr std::string_view kGiven = "given";

// A request as it stands in a document, word for word.
string TextOf(const Node& node) {
  string text = Shown(node);
  for (const read::Member& member : node.members) {
    text += " " + member.name + ":" + TextOf(member.value);
  }
  for (const Node& item : node.items) text += "," + TextOf(item);
  return text;
}

// What all settings make of a request.
struct OfRequest {
  string text;
  Request request;
  Standing standing;
};

class Work {
 public:
  Work(const Node& document, const Device& device, const Sentences* sentences,
       std::optional<OfRequest>* kept)
      : document_(document), device_(device), sentences_(sentences), kept_(*kept) {}

  Discrepancies Do() {
    if (document_.type != NodeType::kObject) {
      found_.push_back(At(document_, DiscrepancyKind::kWrongType, "", "object"));
      return std::move(found_);
    }
    const std::optional<Request> request = ReadRequest(document_, device_, &found_);
    if (request) {
      string text = TextOf(*document_.Find("request")) + (IsGiven() ? " given" : "");
      if (!kept_ || kept_->text != text) {
        kept_ = {std::move(text), *request, IsGiven() ? Standing{} : StandingOf(*request, device_)};
      }
      DoAnswers();
      DoHead();
    }
    std::stable_sort(found_.begin(), found_.end(), [](const Discrepancy& a, const Discrepancy& b) {
      return a.line != b.line ? a.line < b.line : a.column < b.column;
    });
    return std::move(found_);
  }

 private:
  // --- The whole --------------------------------------------------------------------------

  // Whether all is about settings of the user's own, which claim no place among others.
  bool IsGiven() const {
    const Node* const answers = document_.Find("answers");
    if (answers == nullptr || answers->items.size() != 1) return false;
    const Node* const source = answers->items[0].Find("source");
    return source != nullptr && source->type == NodeType::kString && source->text == kGiven;
  }

  void DoHead() {
    ordered_json head = ordered_json::object();
    head["format"] = "vorkel-plan";
    head["version"] = kPlanVersion;
    head["units"] = Units();
    head["tradeoffs_cut"] = ordered_json::array();
    for (const Primitive one : kept_->standing.cut) head["tradeoffs_cut"].push_back(Name(one));
    // The request and the answers are held on their own.
    Node rest = document_;
    std::erase_if(rest.members, [](const read::Member& member) {
      return member.name == "request" || member.name == "answers";
    });
    Differ(head, rest, "", &found_);
  }

  void DoAnswers() {
    const Node* const answers = document_.Find("answers");
    const Node& there = answers != nullptr ? *answers : document_;
    if (answers == nullptr || answers->type != NodeType::kArray) {
      found_.push_back(
          At(there, answers == nullptr ? DiscrepancyKind::kMissing : DiscrepancyKind::kWrongType,
             "answers", "array"));
      if (answers == nullptr) found_.back().found.clear();
      return;
    }
    if (answers->items.empty()) {
      found_.push_back(At(there, DiscrepancyKind::kMissing, "answers[0]", "object"));
      found_.back().found.clear();
      return;
    }
    HoldRequest(kept_->request, document_, &found_);
    std::vector<Claim> claims;
    for (std::size_t i = 0; i < answers->items.size(); ++i) {
      DoAnswer(answers->items[i], "answers[" + std::to_string(i) + "]", &claims);
    }
    if (claims.size() == answers->items.size() && !IsGiven()) {
      HoldSequence(kept_->standing, claims, &found_);
    }
  }

  // --- One answer -------------------------------------------------------------------------

  void DoAnswer(const Node& node, const string& path, std::vector<Claim>* claims) {
    Discrepancies wrong;
    const std::optional<Claim> claim = ReadClaim(kept_->request, device_, node, path, &wrong);
    if (claim) {
      Differ(claim->solved ? Solved(*claim) : Unsolved(*claim), node, path, &wrong);
      if (claim->solved) HoldPlace(*claim, &wrong);
    }
    if (wrong.size() > 1 && node.type == NodeType::kObject) {
      if (auto one = OnlyOne(node, path)) wrong = {*std::move(one)};
    }
    found_.insert(found_.end(), wrong.begin(), wrong.end());
    if (claim) claims->push_back(*claim);
  }

  ordered_json EntriesOfCandidate(const Candidate& candidate) const {
    const Answer answer = Recompute(kept_->request, device_, candidate.ranked.settings,
                                    candidate.order, candidate.origin);
    ordered_json entries = Numbered(candidate.ranked.settings, candidate.order);
    entries.update(EntriesOf(kept_->request, device_, answer, candidate.order, sentences_));
    return entries;
  }

  ordered_json Numbered(const Settings& settings, const PlaceOrder& order) const {
    const auto place = kept_->standing.PlaceOf(settings, order);
    ordered_json entries = ordered_json::object();
    entries["number"] = place ? ordered_json(*place + 1) : ordered_json(nullptr);
    entries["tradeoff"] = kept_->standing.TradeoffOf(settings, order).has_value();
    return entries;
  }

  // Where the settings of an answer come from.
  Candidate CandidateOf(const Claim& claim) const {
    if (IsGiven()) return {{claim.settings, {}}, claim.order, {}};
    for (const auto* const all : {&kept_->standing.candidates, &kept_->standing.tradeoffs}) {
      for (const Candidate& one : *all) {
        if (one.ranked.settings == claim.settings && one.order == claim.order) return one;
      }
    }
    for (const Candidate& one : kept_->standing.as_requested) {
      if (one.ranked.settings == claim.settings && one.order == claim.order) return one;
    }
    return {{claim.settings, {}}, claim.order, {.source = {.search = true}}};
  }

  // The answer of a command that asks the engine for nothing else; null when it is not one.
  const Candidate* AsRequested(const Claim& claim) const {
    if (document_.Find("answers")->items.size() != 1) return nullptr;
    if (claim.number || !claim.is_engine || !claim.variant.empty()) return nullptr;
    for (const Candidate& one : kept_->standing.as_requested) {
      if (one.ranked.settings == claim.settings && one.order == claim.order) return &one;
    }
    return nullptr;
  }

  ordered_json Solved(const Claim& claim) const {
    const Candidate* const as_requested = AsRequested(claim);
    if (as_requested == nullptr) return EntriesOfCandidate(CandidateOf(claim));
    ordered_json entries = EntriesOfCandidate(*as_requested);
    entries["number"] = nullptr;
    entries["tradeoff"] = false;
    return entries;
  }

  ordered_json Unsolved(const Claim& claim) const {
    Answer answer;
    answer.primitive = claim.primitive;
    const auto& all = claim.is_engine ? kept_->standing.engine_refusals : kept_->standing.refusals;
    answer.source.engine = claim.is_engine;
    const auto refusals = all.find(claim.primitive);
    // The reason is told by who makes the document; that there is one is not so where it is solved.
    if (refusals != all.end() && !refusals->second.empty()) {
      answer.refusals = refusals->second;
    } else {
      answer.solved = true;
    }
    ordered_json entries = ordered_json::object();
    entries["number"] = nullptr;
    entries["tradeoff"] = false;
    if (answer.solved) {
      entries["solved"] = true;
      return entries;
    }
    entries.update(
        EntriesOf(kept_->request, device_, answer, OwnPlaces(kept_->request), sentences_));
    return entries;
  }

  // What says that it is a candidate, and is none.
  void HoldPlace(const Claim& claim, Discrepancies* wrong) const {
    if (!claim.number || kept_->standing.PlaceOf(claim.settings, claim.order)) return;
    Candidate candidate = CandidateOf(claim);
    candidate.ranked.figures = FiguresOf(
        Recompute(kept_->request, device_, claim.settings, claim.order, candidate.origin));
    if (*claim.number > kept_->standing.candidates.size()) return;
    const Candidate& right = kept_->standing.candidates[*claim.number - 1];
    if (!IsBefore(kept_->request, right.ranked, candidate.ranked)) return;
    Discrepancy discrepancy = At(*claim.node, DiscrepancyKind::kRanksBefore, claim.path, "");
    discrepancy.settings = right.ranked.settings;
    wrong->push_back(std::move(discrepancy));
  }

  // The only entry with which an answer is not one that the request has; nothing when it is more
  // than one.
  std::optional<Discrepancy> OnlyOne(const Node& node, const string& path) const {
    for (const auto* const all : {&kept_->standing.candidates, &kept_->standing.tradeoffs}) {
      for (const Candidate& one : *all) {
        Discrepancies wrong;
        Differ(EntriesOfCandidate(one), node, path, &wrong);
        if (wrong.size() != 1) continue;
        if (wrong[0].kind == DiscrepancyKind::kDiffers) {
          wrong[0].kind = DiscrepancyKind::kContradicts;
        }
        return wrong[0];
      }
    }
    return std::nullopt;
  }

  const Node& document_;
  const Device& device_;
  const Sentences* const sentences_;
  std::optional<OfRequest>& kept_;
  Discrepancies found_;
};

std::optional<Node> ReadDocument(std::string_view json, read::Mistakes* mistakes) {
  return read::ReadJsonTree(json, "", mistakes);
}

}  // namespace

std::optional<string> PartOf(std::string_view json) {
  read::Mistakes mistakes;
  const std::optional<Node> document = ReadDocument(json, &mistakes);
  const Node* const request = document ? document->Find("request") : nullptr;
  const Node* const part = request != nullptr ? request->Find("device") : nullptr;
  if (part == nullptr || part->type != NodeType::kString) return std::nullopt;
  return part->text;
}

struct Verifier::Kept {
  std::optional<OfRequest> last;
};

Verifier::Verifier(const Device& device, const Sentences* sentences)
    : device_(device), sentences_(sentences), kept_(std::make_unique<Kept>()) {}

Verifier::~Verifier() = default;

Discrepancies Verify(std::string_view json, const Device& device, const Sentences* sentences) {
  return Verifier(device, sentences).Verify(json);
}

Discrepancies Verifier::Verify(std::string_view json) {
  read::Mistakes mistakes;
  const std::optional<Node> document = ReadDocument(json, &mistakes);
  Discrepancies discrepancies;
  for (const read::Mistake& mistake : mistakes) {
    discrepancies.push_back({.kind = DiscrepancyKind::kNotJson,
                             .path = "",
                             .found = mistake.text,
                             .expected = "",
                             .line = mistake.place.line,
                             .column = mistake.place.column,
                             .mistake = mistake});
  }
  if (!document) return discrepancies;
  return Work(*document, device_, sentences_, &kept_->last).Do();
}

}  // namespace planner::verify

// How the entries of a document would have to stand there. doc/planner-json.md describes them.
//
// Tested by verify_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_ENTRIES_H_
#define VORKEL_PLANNER_VERIFY_ENTRIES_H_

#include <cstddef>
#include <nlohmann/json_fwd.hpp>
#include <optional>
#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/verify/Recompute.h"
#include "planner/verify/Verify.h"

namespace planner::verify {

// Stand for any text, and for a list of any texts, where nobody tells the sentences.
nlohmann::ordered_json AnyText();
nlohmann::ordered_json AnyTexts();
bool IsAnyText(const nlohmann::ordered_json& value);
bool IsAnyTexts(const nlohmann::ordered_json& value);

// A number exactly: "148", "297/2".
std::string QuotientText(const Rational& value);

// The words of a document.
std::string WordOf(FindingKind kind);
std::string WordOf(const Source& source);

// All entries of an answer but `number` and `tradeoff`. `sentences` may be null.
nlohmann::ordered_json EntriesOf(const Request& request, const Device& device, const Answer& answer,
                                 const PlaceOrder& order, const Sentences* sentences);

// The units of a document.
nlohmann::ordered_json Units();

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_ENTRIES_H_

// Answers as JSON: doc/planner-json.md describes it, doc/planner.schema.json is its schema. It has
// all that it takes to work every number of it out again, from the request and the device alone:
// settings as whole numbers, and exact numbers, as quotients, beside their doubles.
#ifndef VORKEL_PLANNER_REPORT_JSON_H_
#define VORKEL_PLANNER_REPORT_JSON_H_

#include <cstddef>
#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/plan/Plan.h"

namespace planner::report {

// One answer of a document, and what it is there for.
struct Entry {
  const Answer* answer;
  std::size_t number = 0;  // in the ranking of the plan, from 1; 0: it is not in that
  bool is_tradeoff = false;
};

// What `plan` says: candidate `number`, from 1, which the plan has.
std::vector<Entry> PlanEntries(const plan::Plan& plan, std::size_t number);
// What `compare` says: all candidates, and then the primitives that have none.
std::vector<Entry> CompareEntries(const plan::Plan& plan);
// What `best` says: candidate `number`, the best of each other primitive, at most `most` trade-offs
// beside the candidate, and the best that the engine answers. Each is there once.
std::vector<Entry> BestEntries(const plan::Plan& plan, std::size_t number, std::size_t most);

// A document with some answers to a request, at least one. `front_cut` is that of the plan. It ends
// in a newline.
std::string Json(const Request& request, const Device& device, const std::vector<Entry>& entries,
                 const std::vector<Primitive>& front_cut = {});
// The same in one line, without a newline.
std::string JsonLine(const Request& request, const Device& device,
                     const std::vector<Entry>& entries,
                     const std::vector<Primitive>& front_cut = {});
// The same as a Tcl dict. What is null in JSON is empty here.
std::string Tcl(const Request& request, const Device& device, const std::vector<Entry>& entries,
                const std::vector<Primitive>& front_cut = {});

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_JSON_H_

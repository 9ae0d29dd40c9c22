// What one source - options, a dict, a file - says of a request, and how several sources make one.
//
// Tested by draft_test.cpp.
#ifndef VORKEL_PLANNER_READ_DRAFT_H_
#define VORKEL_PLANNER_READ_DRAFT_H_

#include <optional>
#include <string>
#include <vector>

#include "planner/Request.h"
#include "planner/read/Mistake.h"
#include "planner/read/Units.h"

namespace planner::read {

// What is said, where, and in which words; those of a file are not kept.
template <typename T>
struct Said {
  T value;
  Place place;
  std::string text = {};
};
template <typename T>
using Entry = std::optional<Said<T>>;

// A demand for all outputs, for each of them, or both: then that of an output counts.
struct Demand {
  std::optional<Rational> all;
  Values each;  // empty, or as long as the outputs
};

struct Draft {
  Entry<std::string> device;
  Entry<std::optional<Primitive>> primitive;  // nothing: auto
  Entry<std::vector<Rational>> inputs;
  Entry<Values> outputs;             // frequencies; nothing: the output is not used
  Entry<std::vector<bool>> unasked;  // whose frequencies are only what settings make
  Entry<Values> phases;
  Entry<Values> duties;
  Entry<Demand> tolerance;
  Entry<Demand> phase_tolerance;
  Entry<Demand> duty_tolerance;
  Entry<Demand> max_jitter;
  Entry<Rational> input_jitter;
  Entry<Rational> input_tolerance;
  Entry<Bandwidth> bandwidth;
  Entry<Rank> rank;
  // Switches: whether they are set.
  Entry<bool> low_bandwidth;
  Entry<bool> exact;
  Entry<bool> feedback;
  Entry<bool> prefer_max_vco;
  Entry<bool> int_div0;
  Entry<bool> engine;
  Entry<bool> any_order;
};

// What `options` say, and of the rest what `file` says. Other outputs than those of the file have
// nothing to do with its phases, duty cycles and other demands of single outputs.
Draft Over(const Draft& options, const Draft& file);

// A draft without what says how a plan is to be chosen: that does not concern settings that are
// there.
Draft WithoutChoices(Draft draft);

// A request, and what is said beside it.
struct Reading {
  Request request;
  Entry<std::string> device;  // the name, or its beginning; nothing: the default
  std::vector<Doubt> doubts;
  Draft draft;  // what it is made of
};

// For whom a request is read.
struct Reader {
  // The command is for this primitive alone: its limits count, and --primitive may name no other.
  std::optional<Primitive> primitive = {};
  std::string file = {};  // of --request, for what it does not say; empty: there is none
  // Settings are there, to be evaluated. Else all frequencies are asked for.
  bool evaluates = false;
};

// Makes a request of a draft. What is wrong is added to `mistakes`, and there is none then. That
// inputs or outputs are missing is told only when nothing is wrong already.
std::optional<Reading> Finish(const Draft& draft, const Reader& reader, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_DRAFT_H_

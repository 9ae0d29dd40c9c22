// The certificate of a plan: every number of its JSON worked out again.
//
// What a plan says is recomputed from its request and the device alone, in exact arithmetic and by
// the plainest code there is: one formula a figure, and nested loops over all settings for "nothing
// ranks before this". Nothing of it is shared with the search or with the judge of answers. Only
// figures of jitter are the calculator's (answer/Jitter.h), and what the engine answers is asked of
// the engine again.
//
// The settings of an answer are what is judged, so all other numbers are held against them. But
// where one other entry would make it an answer that the request has, in every number, that one is
// wrong.
//
// Tested by verify_test.cpp and mutation_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_VERIFY_H_
#define VORKEL_PLANNER_VERIFY_VERIFY_H_

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/read/Mistake.h"

namespace planner::verify {

enum class DiscrepancyKind {
  kNotJson,      // the text as a whole: `mistake` says why
  kNoRequest,    // the request in it cannot be read: `mistake` says why
  kMissing,      // an entry that should be there
  kUnknown,      // an entry that should not
  kWrongType,    // expected: the type, such as "number"
  kAbsurd,       // a number with more digits or a larger exponent than any that is written;
                 // expected: what should be there, where that is known
  kNoSetting,    // what the hardware cannot be set to; expected: what it can
  kDiffers,      // expected: the right value
  kContradicts,  // an entry, such as a setting, or a number of the request, that all others
                 // contradict; expected: the value with which they are right
  kMisplaced,    // an answer that ranks before the one above it; expected: where that stands
  kRanksBefore,  // there are settings that rank before the answer, though it is said to be the
                 // best; `settings`
};

struct Discrepancy {
  DiscrepancyKind kind = DiscrepancyKind::kDiffers;
  std::string path;      // "answers[0].outputs[2].error_ppm"; empty: the text as a whole
  std::string found;     // as it stands there; empty: nothing
  std::string expected;  // as it would stand there; empty: nothing
  int line = 0;          // of what is found, both from 1; 0: nowhere
  int column = 0;
  std::optional<read::Mistake> mistake = {};
  std::optional<Settings> settings = {};
  bool operator==(const Discrepancy&) const = default;
};

// The sentences of a document. They are made of findings by who writes the document; without this
// only that they are texts is checked.
class Sentences {
 public:
  virtual ~Sentences() = default;
  // All of them are of this answer.
  virtual std::string Of(const Finding& finding, const Device& device,
                         const Answer& answer) const = 0;
  virtual std::vector<std::string> All(const std::vector<Finding>& findings, const Device& device,
                                       const Answer& answer) const = 0;
  virtual std::vector<std::string> Misses(const Answer& answer) const = 0;
  virtual std::string Reason(const Answer& answer, const Device& device) const = 0;
};

// The part that the request of a plan names; nothing when there is none that can be read.
std::optional<std::string> PartOf(std::string_view json);

// All that is wrong in a plan, in the order in which it stands there; nothing when every number is
// right. `device` is the one that PartOf names. Whatever the text is, nothing is thrown.
std::vector<Discrepancy> Verify(std::string_view json, const Device& device,
                                const Sentences* sentences = nullptr);

// The same for many plans of one device, which must outlive it. What all settings make of a request
// is kept for the next plan of the same request.
class Verifier {
 public:
  explicit Verifier(const Device& device, const Sentences* sentences = nullptr);
  ~Verifier();
  Verifier(const Verifier&) = delete;
  Verifier& operator=(const Verifier&) = delete;

  std::vector<Discrepancy> Verify(std::string_view json);

 private:
  struct Kept;
  const Device& device_;
  const Sentences* sentences_;
  std::unique_ptr<Kept> kept_;
};

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_VERIFY_H_

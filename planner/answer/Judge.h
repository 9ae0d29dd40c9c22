// The parts of Evaluate.
#ifndef VORKEL_PLANNER_ANSWER_JUDGE_H_
#define VORKEL_PLANNER_ANSWER_JUDGE_H_

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Finding.h"
#include "planner/Request.h"
#include "planner/answer/CalculatorRefusal.h"
#include "planner/answer/Evaluate.h"

namespace planner::answer {

// Fills in what settings make: frequencies, phases, duty cycles, jitter, the violations of VCO,
// PFD and each output, the margin, and the notes on missing figures.
void JudgeLoop(const Request& request, const Device& device, const LoopSettings& settings,
               Answer* answer);
void JudgeKru(const Request& request, const Device& device, const KruSettings& settings,
              Answer* answer);

// Judges a frequency at all that its input can be: adds to `violations` for each end of the range
// that it is beyond, and answers its margin. `finding` says what it is the frequency of; the
// tolerance is that of the input, ppm.
Rational Hold(const Rational& value, const Rational& tolerance, const Range& range,
              const Finding& finding, std::vector<Finding>* violations);

// Takes a margin for the smallest where it is that, or the first.
void Lower(const Rational& margin, std::optional<Rational>* smallest);

// Fills in the errors of a used output whose frequency, phase, duty cycle and jitter are there, and
// what it misses.
void JudgeOutput(const Request& request, Primitive primitive, int index, OutputAnswer* output);

// Figures that there are not, gathered by their reasons.
class MissingFigures {
 public:
  void AddJitter(int output, const std::string& reason);
  void AddPhaseError(const std::string& reason) { phase_error_ = reason; }
  // The notes on them; `outputs` is how many the request uses.
  void Note(Primitive primitive, std::size_t outputs, std::vector<Finding>* notes) const;

 private:
  struct Reason {
    std::string text;
    std::vector<int> outputs;
  };
  std::vector<Reason> jitters_;
  std::optional<std::string> phase_error_;
};

// What a user should know beside what is missed and broken, and beside missing figures.
std::vector<Finding> NotesOn(const Request& request, const Answer& answer);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_JUDGE_H_

// Tested by changes_test.cpp.
#include "planner/explain/Question.h"

#include "planner/answer/Evaluate.h"

namespace planner::explain {

std::optional<Settings> Question::Ask() const {
  return search::Within(request, device, primitive, unchanged).Find(relaxed);
}

Answer Question::Judge(const Settings& settings) const {
  return answer::Evaluate(request, device, settings, Source{});
}

LoopLimits& Question::Limits() { return primitive == Primitive::kPll ? *device.pll : *device.tsyn; }

}  // namespace planner::explain

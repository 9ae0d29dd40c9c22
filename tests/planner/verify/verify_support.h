// Requests and plans for the tests of the certificate.
#ifndef VORKEL_TESTS_PLANNER_VERIFY_VERIFY_SUPPORT_H_
#define VORKEL_TESTS_PLANNER_VERIFY_VERIFY_SUPPORT_H_

#include <string>
#include <vector>

#include "planner/Device.h"
#include "planner/plan/Plan.h"
#include "planner/read/Draft.h"
#include "planner/read/MistakeText.h"
#include "planner/read/Options.h"
#include "planner/report/Json.h"
#include "planner/report/VerifyText.h"
#include "planner/verify/Verify.h"
#include "tests/planner/verify/small_devices.h"

namespace planner::verify_test {

// A request from options; what is wrong with them ends the test program.
inline Request RequestOf(const std::vector<read::Option>& options) {
  read::Mistakes mistakes;
  const read::Draft draft = read::ReadOptions(options, &mistakes);
  auto reading = read::Finish(draft, {}, &mistakes);
  if (!reading) throw read::MistakeError(mistakes);
  return reading->request;
}

inline std::string Compared(const Request& request, const planner::Device& device) {
  const plan::Plan plan = plan::Make(request, device);
  return report::Json(request, device, report::CompareEntries(plan), plan.front_cut);
}

// What is wrong, a line each, for messages.
inline std::string Text(const std::vector<verify::Discrepancy>& wrong) {
  return report::VerifyText(wrong, "plan.json", {});
}

}  // namespace planner::verify_test

#endif  // VORKEL_TESTS_PLANNER_VERIFY_VERIFY_SUPPORT_H_

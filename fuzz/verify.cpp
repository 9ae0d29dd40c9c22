// Plans given to the certificate: whatever the text is, it says what is wrong with it. Devices are
// small, so that all their settings are tried quickly; the first letter of the text chooses one.

#include <array>

#include "fuzz/Fuzz.h"
#include "tests/planner/verify/small_devices.h"
#include "planner/verify/Verify.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using planner::verify_test::DeviceOf;
  static const std::array<planner::Device, 3> devices = {
      DeviceOf(planner::verify_test::kOnePll), DeviceOf(planner::verify_test::NarrowLoops()),
      DeviceOf(planner::verify_test::NarrowKrus())};
  if (size == 0 || data[0] < '1' || data[0] > '3') return -1;
  const std::string_view text = fuzz::TextOf(data + 1, size - 1);
  planner::verify::PartOf(text);
  const auto wrong =
      planner::verify::Verify(text, devices[static_cast<std::size_t>(data[0] - '1')]);
  for (const planner::verify::Discrepancy& discrepancy : wrong) {
    fuzz::Require(discrepancy.found != discrepancy.expected || discrepancy.found.empty(),
                  "right and yet wrong: " + discrepancy.path);
  }
  return 0;
}

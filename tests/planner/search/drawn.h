// Devices and requests that are drawn at random: round figures, frequencies that settings make
// exactly, ends of ranges and tolerances that are just met, and anything else.
#ifndef VORKEL_TESTS_PLANNER_SEARCH_DRAWN_H_
#define VORKEL_TESTS_PLANNER_SEARCH_DRAWN_H_

#include <string>

#include "../../compare/Random.h"
#include "planner/Device.h"
#include "planner/Request.h"

namespace drawn {

using compare::Random;
using planner::Device;
using planner::Primitive;
using planner::Request;

// The device that a text in TOML describes, at its grade "1".
Device DeviceOf(const std::string& text);
// A bundled one, by the name of its part: "vk40-2".
Device Bundled(const std::string& name, const std::string& grade);

// A device with one primitive, whose ranges leave only few M and D for an input, MHz.
Device SmallDevice(Random& random, Primitive primitive, const hardware::Rational& input);

// An input in MHz: mostly a usual one.
hardware::Rational Input(Random& random);

// A request with one to `most_outputs` outputs and `input` as its first input.
Request RequestFor(Random& random, const Device& device, Primitive primitive,
                   const hardware::Rational& input, int most_outputs);

// What it asks for, to be told when something is wrong.
std::string TextOf(const Request& request);

}  // namespace drawn

#endif  // VORKEL_TESTS_PLANNER_SEARCH_DRAWN_H_

// The engine's object for one run.
#ifndef VORKEL_PLANNER_ENGINE_OBJECT_H_
#define VORKEL_PLANNER_ENGINE_OBJECT_H_

#include <memory>
#include <vector>

#include "engine/Ip_VorkelImp.h"
#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::engine {

// A new object, which has the limits of the device at hand. Each run has one of its own: the
// solvers leave lists, limits and choices behind that later runs would read.
std::unique_ptr<Ip::VorkelImp> MakeObject(const Device& device);

// Numbers as the engine takes them: "200 33.333000000000006".
Port::StringBase ListOf(const std::vector<double>& numbers);

// The outputs of a request that are used, by their index.
std::vector<std::size_t> UsedOutputs(const Request& request);
// Their frequencies, MHz.
std::vector<double> Frequencies(const Request& request);

}  // namespace planner::engine

#endif  // VORKEL_PLANNER_ENGINE_OBJECT_H_

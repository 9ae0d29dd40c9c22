// The work of a call, counted: the basic blocks of the engine that it runs through.
//
// A block is a stretch of code without a branch. The engine is compiled a second time for these
// tests (CMakeLists.txt), with a call of __sanitizer_cov_trace_pc() in each block, which compilers
// offer for such purposes. So the work of a call is the same number each time, however busy the
// machine is. It depends on the compiler a little, which bounds have to leave room for.
#ifndef VORKEL_TESTS_COST_BLOCKS_H_
#define VORKEL_TESTS_COST_BLOCKS_H_

#include <cstdint>

namespace cost {

// Blocks run through so far.
std::uint64_t Blocks();

// What a call may take, unless `check` warns of the device: 10 ms on a slow core, of some 1.05 ns a
// block.
inline constexpr std::uint64_t kUsual = 10'000'000;

}  // namespace cost

#endif  // VORKEL_TESTS_COST_BLOCKS_H_

#include "tests/cost/Blocks.h"

namespace cost {
namespace {

std::uint64_t blocks = 0;

}  // namespace

std::uint64_t Blocks() { return blocks; }

}  // namespace cost

extern "C" void __sanitizer_cov_trace_pc();
extern "C" void __sanitizer_cov_trace_pc() { ++cost::blocks; }

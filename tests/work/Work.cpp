#include "tests/work/Work.h"

namespace work {
namespace {

std::uint64_t blocks = 0;

}  // namespace

std::uint64_t Blocks() { return blocks; }

}  // namespace work

extern "C" void __sanitizer_cov_trace_pc();
extern "C" void __sanitizer_cov_trace_pc() { ++work::blocks; }

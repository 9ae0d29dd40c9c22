// How times are taken.
#ifndef VORKEL_BENCH_TIMING_H_
#define VORKEL_BENCH_TIMING_H_

#include <time.h>

#include <algorithm>
#include <cstddef>
#include <vector>

namespace bench {

// The time that this thread has worked, seconds. Other programs that take the processor away
// do not add to it; on a quiet machine it goes like the clock on the wall.
inline double WorkedSeconds() {
  timespec time{};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) + 1e-9 * static_cast<double>(time.tv_nsec);
}

// The seconds that one call of `function` takes: the mean of as many calls as fill `enough`
// seconds, at least one. The clock is read after 1, 2, 4, ... calls more, so that reading it
// does not count.
template <typename Function>
double SecondsOfCall(double enough, Function function) {
  long calls = 0;
  double passed = 0.0;
  const double start = WorkedSeconds();
  for (long more = 1; passed < enough; more *= 2) {
    for (long i = 0; i < more; ++i) function();
    calls += more;
    passed = WorkedSeconds() - start;
  }
  return passed / static_cast<double>(calls);
}

// The middle one of the values, the higher one of two. `values` is not empty.
inline double Median(std::vector<double> values) {
  const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
  std::nth_element(values.begin(), middle, values.end());
  return *middle;
}

}  // namespace bench

#endif  // VORKEL_BENCH_TIMING_H_

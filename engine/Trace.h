// The trace of a run: fixed lines on C standard output that tell what a solver does.
//
// A trace line stands in the code where its step is, and reads as a comment:
//
//   TRACE(trace, "DLL---- number of valid VCOs: %d\n", count);
//
// With the trace off it costs one test; its arguments are not evaluated.
//
// A trace can have a gigabyte, so lines are gathered, and written block by block. A trace that
// cannot be written ends there: the run goes on without it, and has the same answer.
//
// Tested by trace_test.cpp.
#ifndef VORKEL_ENGINE_TRACE_H_
#define VORKEL_ENGINE_TRACE_H_

#include <array>
#include <cstddef>

namespace Ip {

class Trace {
 public:
  explicit Trace(bool on);
  // Writes what is left, so that the lines keep their place among what the caller prints after the
  // run.
  ~Trace();
  Trace(const Trace&) = delete;
  Trace& operator=(const Trace&) = delete;

  bool On() const { return on_; }

  // Prints a line; `format` and what follows are those of printf.
  [[gnu::format(printf, 2, 3)]] void Print(const char* format, ...) const;

  // Writes the lines so far: before the host is asked for something, whose messages stand behind
  // them.
  void Write() const;

  // How lines of the last trace of this thread that was on have got lost; kWritten when none have.
  // See StandardOutput.h.
  static int LossOfLast();

 private:
  mutable bool on_;
  mutable std::size_t used_ = 0;
  mutable std::array<char, 32768> block_;  // whole lines
};

}  // namespace Ip

#define TRACE(trace, ...) ((trace).On() ? (trace).Print(__VA_ARGS__) : static_cast<void>(0))

#endif  // VORKEL_ENGINE_TRACE_H_

// The trace of a run: fixed lines on C standard output that tell what a solver does.
//
// A trace line stands in the code where its step is, and reads as a comment:
//
//   TRACE(trace, "DLL---- number of valid VCOs: %d\n", count);
//
// With the trace off it costs one test; its arguments are not evaluated.
#ifndef VORKEL_ENGINE_TRACE_H_
#define VORKEL_ENGINE_TRACE_H_

namespace Ip {

class Trace {
 public:
  explicit Trace(bool on) : on_(on) {}
  // Flushes, so that the lines keep their place among what the caller prints after the run.
  ~Trace();
  Trace(const Trace&) = delete;
  Trace& operator=(const Trace&) = delete;

  bool On() const { return on_; }

  // Prints a line; `format` and what follows are those of printf.
  [[gnu::format(printf, 2, 3)]] void Print(const char* format, ...) const;

 private:
  bool on_;
};

}  // namespace Ip

#define TRACE(trace, ...) ((trace).On() ? (trace).Print(__VA_ARGS__) : static_cast<void>(0))

#endif  // VORKEL_ENGINE_TRACE_H_

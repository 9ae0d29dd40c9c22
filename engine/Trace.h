// The trace of a run: fixed lines on C standard output that tell what a solver does.
//
// A trace line stands in the code where its step is, and reads as a comment:
//
//   TRACE(trace, "DLL---- number of valid VCOs: %d\n", count);
//
// With the trace off it costs one test; its arguments are not evaluated.
//
// Where standard output is closed or its device is full, the rest of the trace is lost and the end
// of the run issues a message. What is lost does not come out later, in a file that is opened in
// place of a closed standard output.
#ifndef VORKEL_ENGINE_TRACE_H_
#define VORKEL_ENGINE_TRACE_H_

namespace Ip {

class Trace {
 public:
  explicit Trace(bool on) : on_(on) {}
  // Flushes, so that the lines keep their place among what the caller prints after the run, and
  // issues the message about lines that are lost.
  ~Trace();
  Trace(const Trace&) = delete;
  Trace& operator=(const Trace&) = delete;

  bool On() const { return on_; }

  // Prints a line; `format` and what follows are those of printf.
  [[gnu::format(printf, 2, 3)]] void Print(const char* format, ...) const;

 private:
  bool on_;
  mutable int error_ = 0;  // why lines are lost, as errno; 0 while none are
};

}  // namespace Ip

#define TRACE(trace, ...) ((trace).On() ? (trace).Print(__VA_ARGS__) : static_cast<void>(0))

#endif  // VORKEL_ENGINE_TRACE_H_

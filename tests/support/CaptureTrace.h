// What the engine prints on C standard output while an object of this class lives.
#ifndef VORKEL_TESTS_SUPPORT_CAPTURETRACE_H_
#define VORKEL_TESTS_SUPPORT_CAPTURETRACE_H_

#include <cstdio>
#include <cstdlib>
#include <string>

class CaptureTrace {
 public:
  CaptureTrace() : saved_(stdout) { stdout = open_memstream(&text_, &size_); }
  ~CaptureTrace() {
    std::fclose(stdout);
    stdout = saved_;
    std::free(text_);
  }
  CaptureTrace(const CaptureTrace&) = delete;
  CaptureTrace& operator=(const CaptureTrace&) = delete;

  // All lines so far.
  std::string Text() {
    std::fflush(stdout);
    return std::string(text_, size_);
  }

 private:
  std::FILE* saved_;
  char* text_ = nullptr;
  std::size_t size_ = 0;
};

#endif  // VORKEL_TESTS_SUPPORT_CAPTURETRACE_H_

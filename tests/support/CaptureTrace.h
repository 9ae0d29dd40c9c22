// What the engine prints on C standard output while an object of this class lives.
#ifndef VORKEL_TESTS_SUPPORT_CAPTURETRACE_H_
#define VORKEL_TESTS_SUPPORT_CAPTURETRACE_H_

#include <cstdio>
#include <cstdlib>
#include <string>

#ifdef _WIN32
#include <fcntl.h>
#include <io.h>

// By a file, which takes the place of descriptor 1.
class CaptureTrace {
 public:
  CaptureTrace() : saved_(Flushed()), file_(std::tmpfile()) {
    _dup2(_fileno(file_), 1);
    mode_ = _setmode(1, _O_BINARY);
  }
  ~CaptureTrace() {
    std::fflush(stdout);
    _dup2(saved_, 1);
    _setmode(1, mode_);
    _close(saved_);
    std::fclose(file_);
  }
  CaptureTrace(const CaptureTrace&) = delete;
  CaptureTrace& operator=(const CaptureTrace&) = delete;

  // All lines so far.
  std::string Text() {
    std::fflush(stdout);
    std::string text(static_cast<std::size_t>(_lseek(1, 0, SEEK_END)), ' ');
    _lseek(1, 0, SEEK_SET);
    std::size_t taken = 0;
    while (taken < text.size()) {
      const int got = _read(1, text.data() + taken, static_cast<unsigned>(text.size() - taken));
      if (got <= 0) break;
      taken += static_cast<std::size_t>(got);
    }
    return text;
  }

 private:
  static int Flushed() {
    std::fflush(stdout);
    return _dup(1);
  }

  int saved_;
  std::FILE* file_;
  int mode_ = 0;
};

#else

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

#endif  // _WIN32

#endif  // VORKEL_TESTS_SUPPORT_CAPTURETRACE_H_

// Numbers as the C locale reads and prints them, whatever locale the process has set.
//
// A host tool may set a locale in which 0.5 is written "0,5": there C's functions take "148.5" for
// 148, and print what no script can read. The locale of one thread can be another than that of its
// process, so that neither the host nor its other threads notice.
#ifndef VORKEL_ENGINE_CLOCALE_H_
#define VORKEL_ENGINE_CLOCALE_H_

#include <locale.h>

#ifdef _WIN32
#include <string>
#endif

namespace Ip {

// While it lives, the thread that has made it is in the C locale. The last one made is the first
// to end.
class CLocale {
 public:
  CLocale() noexcept;
  ~CLocale();
  CLocale(const CLocale&) = delete;
  CLocale& operator=(const CLocale&) = delete;

 private:
#ifdef _WIN32
  int mode_before_;
  std::string before_;
#else
  locale_t before_;
#endif
};

}  // namespace Ip

#endif  // VORKEL_ENGINE_CLOCALE_H_

// A locale with a decimal comma, as a host process may set one.
#ifndef VORKEL_TESTS_SUPPORT_COMMALOCALE_H_
#define VORKEL_TESTS_SUPPORT_COMMALOCALE_H_

#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

// While it lives, the process is in that locale. It is made for the test, since a system need not
// have one installed.
class CommaLocale {
 public:
  CommaLocale() {
    std::string folder = std::filesystem::temp_directory_path() / "vorkel_locale_XXXXXX";
    if (mkdtemp(folder.data()) == nullptr) return;
    folder_ = folder;
    std::ofstream(folder + "/source") << "comment_char %\nescape_char /\n"
                                         "LC_NUMERIC\n"
                                         "decimal_point \",\"\n"
                                         "thousands_sep \".\"\n"
                                         "grouping 3;3\n"
                                         "END LC_NUMERIC\n";
    // It complains of all that a language has beside numbers.
    const std::string make =
        "cd '" + folder + "' && localedef -c -i source ./comma >log 2>&1 || test -d comma";
    if (std::system(make.c_str()) != 0) return;
    setenv("LOCPATH", folder.c_str(), 1);
    std::setlocale(LC_ALL, "comma");
  }
  ~CommaLocale() {
    std::setlocale(LC_ALL, "C");
    unsetenv("LOCPATH");
    if (!folder_.empty()) std::filesystem::remove_all(folder_);
  }
  CommaLocale(const CommaLocale&) = delete;
  CommaLocale& operator=(const CommaLocale&) = delete;

  // Whether it could be made: the numbers of the process have a comma.
  static bool IsSet() {
    char text[8];
    std::snprintf(text, sizeof text, "%.1f", 0.5);
    return std::string(text) == "0,5" && std::strtod("0,5", nullptr) == 0.5;
  }

 private:
  std::string folder_;
};

#endif  // VORKEL_TESTS_SUPPORT_COMMALOCALE_H_

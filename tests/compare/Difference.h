// The first difference between two answers, in words.
#ifndef VORKEL_TESTS_COMPARE_DIFFERENCE_H_
#define VORKEL_TESTS_COMPARE_DIFFERENCE_H_

#include <bit>
#include <cstdint>
#include <cstdio>
#include <string>

namespace compare {

// Collects the first difference.
class Difference {
 public:
  void Doubles(const char* name, int n, double product, double plainValue) {
    if (std::bit_cast<std::uint64_t>(product) == std::bit_cast<std::uint64_t>(plainValue)) return;
    char line[200];
    std::snprintf(line, sizeof line, "%s[%d]: product %.17g, plain %.17g", name, n, product,
                  plainValue);
    Set(line);
  }
  void Ints(const char* name, int n, int product, int plainValue) {
    if (product == plainValue) return;
    char line[200];
    std::snprintf(line, sizeof line, "%s[%d]: product %d, plain %d", name, n, product,
                  plainValue);
    Set(line);
  }
  // Two texts; names the first line that differs.
  void Texts(const std::string& product, const std::string& plainText) {
    if (product == plainText) return;
    std::size_t at = 0;
    while (at < product.size() && at < plainText.size() && product[at] == plainText[at]) ++at;
    const std::size_t line = at == 0 ? 0 : product.rfind('\n', at - 1) + 1;
    auto lineOf = [line](const std::string& text) {
      return text.substr(line, text.find('\n', line) - line);
    };
    Set("trace: product \"" + lineOf(product) + "\", plain \"" + lineOf(plainText) + "\"");
  }
  const std::string& Text() const { return text_; }

 private:
  void Set(const std::string& text) {
    if (text_.empty()) text_ = text;
  }

  std::string text_;
};

}  // namespace compare

#endif  // VORKEL_TESTS_COMPARE_DIFFERENCE_H_

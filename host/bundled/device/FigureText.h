// The numbers of a TOML text, digit by digit. The parser makes doubles of them.
//
// Tested by figure_text_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_FIGURETEXT_H_
#define VORKEL_HOST_BUNDLED_DEVICE_FIGURETEXT_H_

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "host/bundled/device/DeviceError.h"

namespace Device {

class FigureText {
 public:
  // `text` is UTF-8 and must outlive this.
  explicit FigureText(std::string_view text);

  // The decimal (see FigureSource) of the number that begins at a position: a TOML float that is
  // positive and finite.
  std::string DecimalAt(SourcePosition position) const;

 private:
  // The text from a position on.
  std::string_view From(SourcePosition position) const;

  std::string_view text_;
  std::vector<std::size_t> lines_;  // where each begins
};

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_FIGURETEXT_H_

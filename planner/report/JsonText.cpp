// Tested by json_text_test.cpp.
#include "planner/report/JsonText.h"

#include <fmt/format.h>

#include <nlohmann/json.hpp>
#include <string_view>

#include "host/bundled/port/ShownText.h"
#include "planner/read/Letters.h"

namespace planner::report {

using nlohmann::ordered_json;

// Only texts have letters beyond ASCII, and no control letter of ASCII but that of the last number
// passes the library as it is.
std::string JsonText(const ordered_json& data, int indent) {
  std::string text = data.dump(indent, ' ', false, ordered_json::error_handler_t::replace);
  constexpr char kLastOfAscii = 0x7f;
  std::string shown;
  std::size_t taken = 0;
  for (std::size_t place = 0; place < text.size();) {
    if (text[place] >= 0 && text[place] < kLastOfAscii) {
      ++place;
      continue;
    }
    const read::Letter letter = read::LetterAt(text, place);
    if (Port::MovesText(letter.code)) {
      shown.append(text, taken, place - taken);
      shown += fmt::format("\\u{:04x}", static_cast<unsigned>(letter.code));
      taken = place + letter.size;
    }
    place += letter.size;
  }
  if (taken == 0) return text;
  return shown.append(text, taken);
}

}  // namespace planner::report

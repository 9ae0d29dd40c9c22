// The request lists: numbers in one text, separated by blanks.
//
// Tested by list_parsers_test.cpp.

#include <cstddef>
#include <cstdlib>

#include "engine/CLocale.h"
#include "engine/Ip_VorkelImp.h"

namespace Ip {

namespace {

// One rule for the three lists. A list that runs out early has stored its numbers all the
// same; that is meant so, and a later call may read them.
bool ParseList(int count, const Port::StringBase& text, RequestList& list) {
  if (text.IsEmpty() || count < 1 || count > MAX_OUTPUTS) return false;
  const CLocale cLocale;
  std::size_t position = 0;
  for (int slot = 0; slot < count; ++slot) {
    std::size_t begin = 0;
    std::size_t end = 0;
    if (!text.NextTokenRange(" ", &position, &begin, &end)) return false;
    Port::StringBase token = text.Substring(begin, end);
    token.Trim(Port::kWhiteSpace, Port::TrimMode::kBoth);
    // As atof does, but that one knows neither "inf" nor "0x64" on Windows.
    list[static_cast<std::size_t>(slot)] = std::strtod(token.CStr(), nullptr);
  }
  return true;
}

}  // namespace

bool VorkelImp::ParseOutFreqs(int count, const Port::StringBase& text) {
  return ParseList(count, text, requests.reqOutFreq);
}

bool VorkelImp::ParsePhases(int count, const Port::StringBase& text) {
  return ParseList(count, text, requests.reqPhase);
}

bool VorkelImp::ParseDutyCycles(int count, const Port::StringBase& text) {
  return ParseList(count, text, requests.reqDutyCycle);
}

}  // namespace Ip

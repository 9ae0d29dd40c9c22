// Request lists: the engine's parsers against the plain one. The first line is the count.

#include <bit>

#include "engine/Ip_VorkelImp.h"
#include "fuzz/Fuzz.h"
#include "tests/plain/plain_lists.h"

namespace {

using Parser = bool (Ip::VorkelImp::*)(int count, const Port::StringBase& text);

void Compare(Ip::VorkelImp& imp, Parser parser, Ip::RequestList& list, int count,
             const std::string& text) {
  // What a list held before must not matter, and stays beyond what is stored.
  plain::RequestLists lists;
  for (std::size_t i = 0; i < list.size(); ++i) {
    list[i] = lists.outFreq[i] = -1.0 - static_cast<double>(i);
  }
  const bool all = (imp.*parser)(count, text.c_str());
  // A text of C ends at its first zero.
  const bool plain_all =
      plain::ParseList(text.c_str(), count, plain::kMaxOutputs, lists.outFreq);
  fuzz::Require(all == plain_all, "whether a list is complete");
  for (std::size_t i = 0; i < list.size(); ++i) {
    fuzz::Require(std::bit_cast<std::uint64_t>(list[i]) ==
                      std::bit_cast<std::uint64_t>(lists.outFreq[i]),
                  "number " + std::to_string(i) + " of a list");
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static Ip::VorkelImp imp(nullptr);
  const std::string_view input = fuzz::TextOf(data, size);
  const std::size_t end = input.find('\n');
  if (end == std::string_view::npos) return -1;
  const int count = static_cast<int>(std::strtol(std::string(input.substr(0, end)).c_str(), nullptr, 10));
  const std::string text(input.substr(end + 1));
  Compare(imp, &Ip::VorkelImp::ParseOutFreqs, imp.requests.reqOutFreq, count, text);
  Compare(imp, &Ip::VorkelImp::ParsePhases, imp.requests.reqPhase, count, text);
  Compare(imp, &Ip::VorkelImp::ParseDutyCycles, imp.requests.reqDutyCycle, count, text);
  return 0;
}

// Requests in Tcl: the program that reads them answers, whatever the text is, and what it answers
// can be read. Each input takes two processes, so that there are few of them.

#include "cli/TclRequest.h"
#include "fuzz/Requests.h"
#include "planner/read/RequestTcl.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const cli::Setting setting = [] {
    cli::Setting here;
    here.folder = VORKEL_SOURCE_DIR "/cli";
    return here;
  }();
  planner::read::Mistakes mistakes;
  const std::string answer = cli::AskTcl(std::string(fuzz::TextOf(data, size)), setting);
  const planner::read::Draft draft =
      planner::read::ReadTclAnswer(answer, "request.tcl", &mistakes);
  fuzz::FinishDraft(draft, std::move(mistakes));
  return 0;
}

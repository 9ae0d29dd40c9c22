#include "cli/Commands.h"

#include "cli/BatchCommand.h"
#include "cli/CheckCommand.h"
#include "cli/DevicesCommand.h"
#include "cli/EngineCommand.h"
#include "cli/EvaluateCommand.h"
#include "cli/ExplainCommand.h"
#include "cli/Help.h"
#include "cli/PlanCommand.h"
#include "cli/ReachCommand.h"
#include "cli/RelationsCommand.h"
#include "cli/VerifyCommand.h"

namespace cli {

namespace {

constexpr std::string_view kLoopArguments = "--in F[,F2] --out LIST [OPTION...]";
constexpr std::string_view kKruArguments = "--in F --out LIST [OPTION...]";

// The examples: 27 MHz times 33 is 891 MHz, of which 148.5, 74.25 and 27 MHz are whole parts; 25
// MHz times 20 is 500 MHz, of which 125, 62.5 and 25 MHz are. 100 MHz times 6 is 600 MHz, and 0 and
// 90 degrees are steps of its dividers; half of 100 MHz, doubled, as it is and times 3; 100 MHz
// times 3 / 2, as it is and halved. Of 100 MHz no VCO has both 148.5 and 27 MHz as whole parts, and
// there is no 333 MHz with a phase.
constexpr Command kCommands[] = {
    {"plan", kLoopArguments, "find the settings that serve best, and say why",
     "--in 27MHz --out 148.5,74.25,27", "", true, RunPlan},
    {"compare", kLoopArguments, "show what all primitives have to offer",
     "--in 25 --out 125,62.5,25", "", true, RunPlan},
    {"best", kLoopArguments, "show the best of all settings, with the trade-offs",
     "--in 100 --out 148.5,74.25,27", "", true, RunPlan},
    {"explain", kLoopArguments, "say why a request fails, and what would work",
     "--in 100 --out 333 --phase 90deg",
     "The exit status is 0 also when the request is not possible: an explanation is what was asked "
     "for.",
     true, RunExplain},
    {"relations", kLoopArguments, "tell how the clocks of a plan relate, and how data can cross",
     "--in 27MHz --out 148.5,74.25,27", "", true, RunRelations},
    {"tsyn", kLoopArguments, "find the settings of a TSYN", "--in 27 --out 148.5,74.25,27", "",
     true, RunEngine},
    {"pll", kLoopArguments, "find the settings of a PLL", "--in 100 --out 200,100 --phase 0,90", "",
     true, RunEngine},
    {"kru", kKruArguments, "find the settings of a KRU_SP",
     "--in 100 --out 100,50,150 --phase 0,180,0 --feedback", "", true, RunEngine},
    {"clkgen", kKruArguments, "find the settings of a KRU_CLKGEN", "--in 100 --out 150,75", "",
     true, RunEngine},
    {"reach", "--in F[,F2] [OPTION...]", "list the frequencies that an output can have",
     "--in 27 --primitive PLL --near 148.5",
     "Without --primitive it asks all that the device has. The output stands alone: the others are "
     "not used. Each frequency has the settings that plan ranks first for it.",
     true, RunReach},
    {"batch", "[FILE] [OPTION...]", "plan many requests, one on each line",
     "examples/batch/requests.jsonl",
     "FILE has a request in JSON on each line, as --request takes it, and maybe an \"id\"; without "
     "it, or with -, that is standard input. Options replace what the lines say. Each line gets a "
     "line of JSON: its number, its id, a status (within, off, unsolved or wrong) and its plan. The "
     "exit status is that of the worst: 4 when the program failed, 2 with a line that is wrong, 1 "
     "with one that is unsolved, 3 with one that is off, else 0.",
     true, RunBatch},
    {"evaluate", "[FILE] [OPTION...]", "say what settings of your own make",
     "--in 27 --m 44 --d 1 --divide 8,16,44",
     "FILE is a plan as --format json writes it, perhaps edited: its settings and its request count, "
     "its figures do not; - is standard input. Options replace what it says. Without --out there is "
     "nothing to compare the frequencies with. Settings that the primitive cannot have are refused; "
     "those that break a limit of the device end with exit status 3.",
     true, RunEvaluate},
    {"devices", "[NAME]", "list the devices, or all limits of one", "vk40",
     "NAME is a device, or a part name with package and grade; the beginning is enough where only "
     "one goes on like it.",
     false, RunDevices},
    {"check", "FILE", "say what is wrong with a device file", "devices/vk40.toml",
     "FILE is named DEVICE.toml. Mistakes are on standard error, with line and column, and the exit "
     "status is 2. Missing keywords and limits that contradict each other are no mistakes: they are "
     "reported with exit status 0.",
     false, RunCheck},
    {"verify", "FILE", "work every number of a plan in JSON out again", "plan.json",
     "FILE is what --format json of another command has written; - is standard input. Entries that "
     "are wrong are on standard error, with line and column, and the exit status is 2. So it is when "
     "there are settings that rank before a plan's best.",
     false, RunVerify},
    {"help", "[COMMAND]", "show this help", "plan", "", false, RunHelp},
    {"version", "", "show the version", "", "", false, RunVersion},
};

}  // namespace

std::span<const Command> Commands() { return kCommands; }

const Command* FindCommand(std::string_view name) {
  for (const Command& command : kCommands) {
    if (command.name == name) return &command;
  }
  return nullptr;
}

}  // namespace cli

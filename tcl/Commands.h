// The commands of the package. Each takes the words behind its name and answers a dict; what is
// wrong it throws as Failure.
#ifndef VORKEL_TCL_COMMANDS_H_
#define VORKEL_TCL_COMMANDS_H_

#include <tcl.h>

#include <string>

#include "tcl/Given.h"

namespace tcl {

// vorkel::plan ?request? ?-option value ...? ?-pick N?
//   The answer that ranks first, or the N-th.
std::string Plan(Words words);
// vorkel::compare ?request? ?-option value ...?
//   All candidates, the best first.
std::string Compare(Words words);
// vorkel::best ?request? ?-option value ...? ?-pick N? ?-front N?
//   The best, that of each other primitive, trade-offs, at most N, and the engine's best.
std::string Best(Words words);
// vorkel::relations ?request? ?-option value ...? ?-pick N? ?-gap gap?
//   How the clocks of the answer that ranks first, or of the N-th, relate.
std::string Relations(Words words);
// vorkel::explain ?request? ?-option value ...? ?-oscillators list?
//   What is in the way of a request, and what would do.
std::string Explain(Words words);
// vorkel::evaluate ?request? ?-option value ...? ?-m M? ?-d D? ?-divide list? ?-json text? ...
//   What settings make: those of options, or of a plan in JSON.
std::string Evaluate(Words words);
// vorkel::devices ?name?
//   The devices that there are, or one of them with its limits.
std::string Devices(Words words);
// vorkel::check file
//   What is wrong with a device file, and what is doubtful.
std::string Check(Words words);

// vorkel::reach -in frequency ?-option value ...?
//   Which frequencies an output can have.
std::string Reach(Words words);

// Makes them in an interpreter.
void MakeCommands(Tcl_Interp* interp);

}  // namespace tcl

#endif  // VORKEL_TCL_COMMANDS_H_

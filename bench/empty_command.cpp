// Tcl commands to hold a method call against: what a call costs that does nothing, and what the
// conversion of a method's words, and of its answer, adds to that.
//
// For each method of the table below there are, with the method's words,
//   Bench::Words::METHOD   reads the method's name and converts its argument as the method does
//   Bench::Answer::METHOD  the same, and answers in the method's format
// and for all of them
//   Bench::Empty           does nothing, whatever its words
//   Bench::WorkedSeconds   the time that the thread has worked
#include <tcl.h>

#include <array>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "bench/Timing.h"
#include "host/Port_StringBase.h"

namespace {

enum class Argument { kNone, kCount, kFlag, kText };
enum class Answer { kNone, kNumber, kNumberOfFour, kCount };

struct Method {
  const char* name;
  Argument argument;
  Answer answer;
};

constexpr std::array<Method, 4> kMethods = {{
    {"GetChosenVCO", Argument::kNone, Answer::kNumberOfFour},
    {"GetChosenDivN", Argument::kCount, Answer::kCount},
    {"SetLowBandwidth", Argument::kFlag, Answer::kNone},
    {"GetSpdKeyValue", Argument::kText, Answer::kNumber},
}};

// What is answered: numbers as a clock manager has them. Volatile, so that they are formatted
// at every call.
volatile double number = 600.0;
volatile int count = 6;

// Where conversions end up, so that none of them is left out.
volatile long converted = 0;

void ConvertWords(Argument argument, int objc, Tcl_Obj* const* objv) {
  if (objc > 1) converted = Tcl_GetString(objv[1])[0];
  if (objc <= 2) return;
  const char* const text = Tcl_GetString(objv[2]);
  switch (argument) {
    case Argument::kNone: break;
    case Argument::kCount: converted = std::strtol(text, nullptr, 10); break;
    case Argument::kFlag: converted = Port::StringBase(text).Compare("true") == 0; break;
    case Argument::kText: {
      const Port::StringBase copy = text;
      converted = copy.CStr()[0];
      break;
    }
  }
}

void SetAnswer(Answer answer, Tcl_Interp* interp) {
  std::array<char, 512> text;
  switch (answer) {
    case Answer::kNone: return;
    case Answer::kNumber: std::snprintf(text.data(), text.size(), "%3.3f", number); break;
    case Answer::kNumberOfFour: std::snprintf(text.data(), text.size(), "%4.3f", number); break;
    case Answer::kCount: std::snprintf(text.data(), text.size(), "%d", count); break;
  }
  Tcl_SetResult(interp, text.data(), TCL_VOLATILE);
}

int Empty(ClientData, Tcl_Interp*, int, Tcl_Obj* const*) { return TCL_OK; }

int Words(ClientData data, Tcl_Interp*, int objc, Tcl_Obj* const* objv) {
  ConvertWords(static_cast<const Method*>(data)->argument, objc, objv);
  return TCL_OK;
}

int WordsAndAnswer(ClientData data, Tcl_Interp* interp, int objc, Tcl_Obj* const* objv) {
  const Method* const method = static_cast<const Method*>(data);
  ConvertWords(method->argument, objc, objv);
  SetAnswer(method->answer, interp);
  return TCL_OK;
}

int WorkedSeconds(ClientData, Tcl_Interp* interp, int, Tcl_Obj* const*) {
  Tcl_SetObjResult(interp, Tcl_NewDoubleObj(bench::WorkedSeconds()));
  return TCL_OK;
}

}  // namespace

extern "C" DLLEXPORT int Bench_Init(Tcl_Interp* interp);

int Bench_Init(Tcl_Interp* interp) {
  if (Tcl_InitStubs(interp, "8.4", 0) == nullptr) return TCL_ERROR;
  Tcl_CreateObjCommand(interp, "::Bench::Empty", Empty, nullptr, nullptr);
  Tcl_CreateObjCommand(interp, "::Bench::WorkedSeconds", WorkedSeconds, nullptr, nullptr);
  for (const Method& method : kMethods) {
    const std::string name = method.name;
    void* const data = const_cast<Method*>(&method);
    Tcl_CreateObjCommand(interp, ("::Bench::Words::" + name).c_str(), Words, data, nullptr);
    Tcl_CreateObjCommand(interp, ("::Bench::Answer::" + name).c_str(), WordsAndAnswer, data,
                         nullptr);
  }
  return TCL_OK;
}

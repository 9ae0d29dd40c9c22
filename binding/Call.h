// What all methods do alike with a script call: count its words, find the implementation
// object, convert arguments and set the result.
//
// Arguments are numbered from 0, without the handle and the method name. Conversions check
// nothing: text that is no number reads as 0, and only "true" is a set flag. A method reads its
// words from the first to the last, each converted before the next is looked at: so it holds them
// in locals, since C++ leaves open in which order the arguments of a call are evaluated.
//
// The method runs in the C locale as long as the call lives: words and results are the same in
// every host.
#ifndef VORKEL_BINDING_CALL_H_
#define VORKEL_BINDING_CALL_H_

#include "binding/TclCalls.h"
#include "binding/VorkelPtrHandle.h"
#include "engine/CLocale.h"

namespace Ip {

class Call {
 public:
  Call(int objc, Words objv, Tcl_Interp* interp) : objc_(objc), objv_(objv), interp_(interp) {}

  // True when the call has exactly `arguments` arguments; else the result says, under the
  // method's name, that it has not.
  bool HasArguments(int arguments, const char* method) const;

  // The implementation object of a call with `arguments` arguments. Null, with the reason as
  // the result, when their number is another or the handle has no object; `missing` is the
  // text for that, by default "Unable to obtain ..." with the method's name.
  VorkelImp* Object(const VorkelPtrHandle& handle, int arguments, const char* method,
                    const char* missing = nullptr) const;

  const char* Text(int argument) const;
  Port::StringBase String(int argument) const { return Text(argument); }
  double Number(int argument) const;
  // A count or an index, as atoi reads it: of a number that no int holds, the low 32 bits. A
  // number that no long holds is the nearest long before that.
  int Count(int argument) const;
  bool Flag(int argument) const;

  // Set the result and return the status of a method that has worked: a text, or what printf
  // makes of a format and its arguments (at most 511 characters).
  int AnswerText(const char* text) const;
  [[gnu::format(printf, 2, 3)]] int Answer(const char* format, ...) const;

  // The same for a number, by "%3.3f" or "%4.3f", and for a count, by "%d".
  int AnswerNumber(const char* format, double number) const;
  int AnswerCount(int count) const;

  // The answer of a calculation. A trace of it that could not be written is told by a message:
  // once, until one could be written again.
  int AnswerRun(bool traced, const char* text) const;

  // Sets the result of a method that has failed and returns TCL_ERROR.
  int Fail(const char* message) const;

  // The answer of a calculator query: its figure in the usual format, or its error text.
  int AnswerQuery(bool answered, double figure, const Port::StringBase& error) const;

 private:
  int objc_;
  Words objv_;
  Tcl_Interp* interp_;
  CLocale cLocale_;
};

}  // namespace Ip

#endif  // VORKEL_BINDING_CALL_H_

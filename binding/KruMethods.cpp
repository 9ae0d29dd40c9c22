// The methods that run the KRU_SP and KRU_CLKGEN solvers and read what they have chosen.

#include "binding/Call.h"
#include "engine/ResultTexts.h"

namespace Ip {

// Frequency and phase lists, input frequency, number of outputs, feedback and trace flags.
int VorkelPtrHandle::KruCalculateActuals(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 6, "KruCalculateActuals");
  if (imp == nullptr) return TCL_ERROR;
  const Port::StringBase outFreqs = call.String(0);
  const Port::StringBase phases = call.String(1);
  const double inFreq = call.Number(2);
  const int numOut = call.Count(3);
  const bool feedbackUsed = call.Flag(4);
  const bool verbose = call.Flag(5);
  const int code =
      imp->KruCalculateActuals(outFreqs, phases, inFreq, numOut, feedbackUsed, verbose);
  return call.AnswerRun(verbose, KruResultText(false, code, numOut));
}

// Frequency and phase lists, input frequency, number of outputs and trace flag.
int VorkelPtrHandle::KruClkgenCalculateActuals(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 5, "KruClkgenCalculateActuals");
  if (imp == nullptr) return TCL_ERROR;
  const Port::StringBase outFreqs = call.String(0);
  const Port::StringBase phases = call.String(1);
  const double inFreq = call.Number(2);
  const int numOut = call.Count(3);
  const bool verbose = call.Flag(4);
  const int code = imp->KruClkgenCalculateActuals(outFreqs, phases, inFreq, numOut, verbose);
  return call.AnswerRun(verbose, KruResultText(true, code, numOut));
}

int VorkelPtrHandle::GetKruChosenM(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetKruChosenM");
  return imp == nullptr ? TCL_ERROR : call.AnswerCount(imp->GetKruChosenM());
}

int VorkelPtrHandle::GetKruChosenD(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetKruChosenD");
  return imp == nullptr ? TCL_ERROR : call.AnswerCount(imp->GetKruChosenD());
}

int VorkelPtrHandle::GetKruChosenPhaseShift(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetKruChosenPhaseShift");
  return imp == nullptr ? TCL_ERROR : call.AnswerCount(imp->GetKruChosenPhaseShift());
}

int VorkelPtrHandle::GetKruChosenPhaseOffset(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetKruChosenPhaseOffset");
  return imp == nullptr ? TCL_ERROR : call.AnswerNumber("%3.3f", imp->GetKruChosenPhaseOffset());
}

// CLKDV and CLKFXDV are one value, which the two methods write differently.
int VorkelPtrHandle::GetKruChosenClkdv(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetKruChosenClkdv");
  return imp == nullptr ? TCL_ERROR : call.Answer("%2.1f", imp->GetKruChosenClkdv());
}

int VorkelPtrHandle::GetKruChosenClkfxdv(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetKruChosenClkfxdv");
  return imp == nullptr ? TCL_ERROR : call.Answer("%2.0f", imp->GetKruChosenClkfxdv());
}

int VorkelPtrHandle::GetKruChosenDivBy2(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetKruChosenDivBy2");
  if (imp == nullptr) return TCL_ERROR;
  return call.AnswerText(imp->GetKruChosenDivBy2() ? "true" : "false");
}

int VorkelPtrHandle::GetKruChosenPinname(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 1, "GetKruChosenPinname");
  if (imp == nullptr) return TCL_ERROR;
  return call.AnswerText(imp->GetKruChosenPinname(call.Count(0)).CStr());
}

int VorkelPtrHandle::GetKruChosenOutFreqN(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 2, "GetKruChosenOutFreqN");
  if (imp == nullptr) return TCL_ERROR;
  const double inputFreq = call.Number(0);
  const int n = call.Count(1);
  return call.AnswerNumber("%4.3f", imp->GetKruChosenOutFreqN(inputFreq, n));
}

}  // namespace Ip

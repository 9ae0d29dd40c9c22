// The methods that run the PLL/TSYN solver and read what it has chosen.

#include "binding/Call.h"
#include "engine/Numbers.h"
#include "engine/ResultTexts.h"

namespace Ip {

namespace {

// The two minimum-power methods: frequency list, both input frequencies, count, the two
// option flags and the trace flag.
int CalculateOutFreqs(const Call& call, VorkelImp& imp, int prim, PllEntry entry) {
  const Port::StringBase outFreqs = call.String(0);
  const double inFreq = call.Number(1);
  const double inFreq2 = call.Number(2);
  const int count = call.Count(3);
  const bool preferMaxVco = call.Flag(4);
  const bool intDiv0Only = call.Flag(5);
  const bool verbose = call.Flag(6);
  const int code = imp.CalculateMinPowerOutFreqs(outFreqs, inFreq, inFreq2, count, preferMaxVco,
                                                 intDiv0Only, prim, verbose);
  return call.AnswerRun(verbose, PllResultText(entry, code, count));
}

}  // namespace

int VorkelPtrHandle::TSYNCalculateActualOutFreqs(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(
      *this, 7, "TSYNCalculateActualOutFreqs",
      "Unable to obtain Implementation object for VorkelPtrHandle::TSYNCalculateActualOutFreq");
  if (imp == nullptr) return TCL_ERROR;
  return CalculateOutFreqs(call, *imp, Pll::kTsyn, PllEntry::kTsynFrequencies);
}

int VorkelPtrHandle::PLLCalculateActualOutFreqs(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(
      *this, 7, "PLLCalculateActualOutFreqs",
      "Unable to obtain Implementation object for VorkelPtrHandle::PLLCalculateActualOutFreq");
  if (imp == nullptr) return TCL_ERROR;
  return CalculateOutFreqs(call, *imp, Pll::kPll, PllEntry::kPllFrequencies);
}

// Frequency, phase and duty-cycle lists, both input frequencies, count, the two option flags,
// the PLL flag and the trace flag.
int VorkelPtrHandle::GetClosestSolution(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 10, "GetClosestSolution");
  if (imp == nullptr) return TCL_ERROR;
  const Port::StringBase outFreqs = call.String(0);
  const Port::StringBase phases = call.String(1);
  const Port::StringBase dutyCycles = call.String(2);
  const double inFreq = call.Number(3);
  const double inFreq2 = call.Number(4);
  const int count = call.Count(5);
  const bool preferMaxVco = call.Flag(6);
  const bool intDiv0Only = call.Flag(7);
  const int prim = call.Flag(8) ? Pll::kPll : Pll::kTsyn;
  const bool verbose = call.Flag(9);
  const int code = imp->GetClosestSolution(outFreqs, phases, dutyCycles, inFreq, inFreq2, count,
                                           preferMaxVco, intDiv0Only, prim, verbose);
  return call.AnswerRun(verbose, PllResultText(PllEntry::kClosestSolution, code, count));
}

int VorkelPtrHandle::GetChosenM(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetChosenM");
  return imp == nullptr ? TCL_ERROR : call.AnswerNumber("%3.3f", imp->GetChosenM());
}

int VorkelPtrHandle::GetChosenMInt(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetChosenMInt");
  return imp == nullptr ? TCL_ERROR : call.AnswerCount(TruncateToInt(imp->GetChosenM()));
}

int VorkelPtrHandle::GetChosenD(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetChosenD");
  return imp == nullptr ? TCL_ERROR : call.AnswerCount(imp->GetChosenD());
}

int VorkelPtrHandle::GetChosenDiv0(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetChosenDiv0");
  return imp == nullptr ? TCL_ERROR : call.AnswerNumber("%3.3f", imp->GetChosenDiv0());
}

int VorkelPtrHandle::GetChosenDiv0Int(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetChosenDiv0Int");
  return imp == nullptr ? TCL_ERROR : call.AnswerCount(TruncateToInt(imp->GetChosenDiv0()));
}

int VorkelPtrHandle::GetChosenDivN(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 1, "GetChosenDivN");
  return imp == nullptr ? TCL_ERROR : call.AnswerCount(imp->GetChosenDivN(call.Count(0)));
}

int VorkelPtrHandle::GetChosenVCO(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetChosenVCO");
  return imp == nullptr ? TCL_ERROR : call.AnswerNumber("%4.3f", imp->GetChosenVCO());
}

int VorkelPtrHandle::GetChosenOutFreqN(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 1, "GetChosenOutFreqN");
  if (imp == nullptr) return TCL_ERROR;
  return call.AnswerNumber("%4.3f", imp->GetChosenOutFreqN(call.Count(0)));
}

int VorkelPtrHandle::GetChosenPhaseN(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 1, "GetChosenPhaseN");
  if (imp == nullptr) return TCL_ERROR;
  return call.AnswerNumber("%4.3f", imp->GetChosenPhaseN(call.Count(0)));
}

int VorkelPtrHandle::GetChosenDutyCycleN(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 1, "GetChosenDutyCycleN");
  if (imp == nullptr) return TCL_ERROR;
  return call.AnswerNumber("%4.3f", imp->GetChosenDutyCycleN(call.Count(0)));
}

}  // namespace Ip

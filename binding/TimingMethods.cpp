// The methods that query timing figures. What the arguments mean is the calculator's affair:
// they go to it in the order of the words.

#include "binding/Call.h"

namespace Ip {

namespace {

// The two KRU jitter methods: input frequency, pin name, three flags, two numbers.
int KruPkToPkJitter(const Call& call, VorkelImp& imp, bool isKruClkgen) {
  const double a1 = call.Number(0);
  const Port::StringBase pin = call.String(1);
  const bool f1 = call.Flag(2);
  const bool f2 = call.Flag(3);
  const bool f3 = call.Flag(4);
  const double a2 = call.Number(5);
  const double a3 = call.Number(6);
  Port::StringBase error;
  double jitter = 0.0;
  const bool answered =
      imp.GetKruPkToPkJitter(a1, pin, isKruClkgen, f1, f2, f3, a2, a3, &error, &jitter);
  return call.AnswerQuery(answered, jitter, error);
}

}  // namespace

int VorkelPtrHandle::GetVcoFreq(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 4, "GetVcoFreq");
  if (imp == nullptr) return TCL_ERROR;
  const double a1 = call.Number(0);
  const double a2 = call.Number(1);
  const double a3 = call.Number(2);
  const double a4 = call.Number(3);
  Port::StringBase error;
  double frequency = 0.0;
  const bool answered = imp->GetVcoFreq(a1, a2, a3, a4, &error, &frequency);
  return call.AnswerQuery(answered, frequency, error);
}

int VorkelPtrHandle::GetPLLPkToPkJitter(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 6, "GetPLLPkToPkJitter");
  if (imp == nullptr) return TCL_ERROR;
  const double a1 = call.Number(0);
  const double a2 = call.Number(1);
  const double a3 = call.Number(2);
  const Port::StringBase t4 = call.String(3);
  const double a5 = call.Number(4);
  const double a6 = call.Number(5);
  Port::StringBase error;
  double jitter = 0.0;
  const bool answered = imp->GetPLLPkToPkJitter(a1, a2, a3, t4, a5, a6, &error, &jitter);
  return call.AnswerQuery(answered, jitter, error);
}

int VorkelPtrHandle::GetKRUPkToPkJitter(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(
      *this, 7, "GetKRUPkToPkJitter",
      "Unable to obtain Implementation object for VorkelPtrHandle::GetKruPkToPkJitter");
  return imp == nullptr ? TCL_ERROR : KruPkToPkJitter(call, *imp, false);
}

int VorkelPtrHandle::GetKRU_CLKGENPkToPkJitter(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 7, "GetKRU_CLKGENPkToPkJitter");
  return imp == nullptr ? TCL_ERROR : KruPkToPkJitter(call, *imp, true);
}

int VorkelPtrHandle::GetPLLPhaseError(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 3, "GetPLLPhaseError");
  if (imp == nullptr) return TCL_ERROR;
  const double a1 = call.Number(0);
  const double a2 = call.Number(1);
  const Port::StringBase t3 = call.String(2);
  Port::StringBase error;
  double phaseError = 0.0;
  const bool answered = imp->GetPLLPhaseError(a1, a2, t3, &error, &phaseError);
  return call.AnswerQuery(answered, phaseError, error);
}

int VorkelPtrHandle::GetKRUPhaseError(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 0, "GetKRUPhaseError");
  if (imp == nullptr) return TCL_ERROR;
  Port::StringBase error;
  double phaseError = 0.0;
  const bool answered = imp->GetKRUPhaseError(&error, &phaseError);
  return call.AnswerQuery(answered, phaseError, error);
}

int VorkelPtrHandle::GetKRUPeriodPhaseDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(
      *this, 6, "GetKRUPeriodPhaseDutyCycle",
      "Unable to obtain Implementation object for VorkelPtrHandle::GetKruPeriodPhaseDutyCycle");
  if (imp == nullptr) return TCL_ERROR;
  const double a1 = call.Number(0);
  const Port::StringBase pin = call.String(1);
  const bool f1 = call.Flag(2);
  const double a2 = call.Number(3);
  const double a3 = call.Number(4);
  const double a4 = call.Number(5);
  Port::StringBase error;
  double period = 0.0;
  double phase = 0.0;
  double dutyCycle = 0.0;
  const bool answered = imp->GetKRUPeriodPhaseDutyCycle(a1, pin, f1, a2, a3, a4, &error, &period,
                                                        &phase, &dutyCycle);
  return call.AnswerQuery(answered, period, error);
}

int VorkelPtrHandle::GetPLLPeriodPhaseDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(
      *this, 7, "GetPLLPeriodPhaseDutyCycle",
      "Unable to obtain Implementation object for VorkelPtrHandle::GetPllPeriodPhaseDutyCycle");
  if (imp == nullptr) return TCL_ERROR;
  const double a1 = call.Number(0);
  const double a2 = call.Number(1);
  const double a3 = call.Number(2);
  const double a4 = call.Number(3);
  const double a5 = call.Number(4);
  const double a6 = call.Number(5);
  const double a7 = call.Number(6);
  Port::StringBase error;
  double period = 0.0;
  double phase = 0.0;
  double dutyCycle = 0.0;
  const bool answered = imp->GetPLLPeriodPhaseDutyCycle(a1, a2, a3, a4, a5, a6, a7, &error,
                                                        &period, &phase, &dutyCycle);
  return call.AnswerQuery(answered, period, error);
}

int VorkelPtrHandle::GetLatestPhase(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetLatestPhase");
  return imp == nullptr ? TCL_ERROR : call.AnswerNumber("%3.3f", imp->GetLatestPhase());
}

int VorkelPtrHandle::GetLatestDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetLatestDutyCycle");
  return imp == nullptr ? TCL_ERROR : call.AnswerNumber("%3.3f", imp->GetLatestDutyCycle());
}

int VorkelPtrHandle::TSYNCalculateActualPhase(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 3, "TSYNCalculateActualPhase");
  if (imp == nullptr) return TCL_ERROR;
  const double phase = call.Number(0);
  const double divider = call.Number(1);
  const bool flag = call.Flag(2);
  return call.AnswerNumber("%3.3f", imp->TSYNCalculateActualPhase(&phase, &divider, flag));
}

// The flag is read as that of the phase is, and has no effect either. The engine answers with a
// fraction.
int VorkelPtrHandle::TSYNCalculateActualDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 3, "TSYNCalculateActualDutyCycle");
  if (imp == nullptr) return TCL_ERROR;
  const double dutyCycle = call.Number(0);
  const double divider = call.Number(1);
  [[maybe_unused]] const bool flag = call.Flag(2);
  const double actual = imp->TSYNCalculateActualDutyCycle(&dutyCycle, &divider);
  return call.AnswerNumber("%3.3f", actual * 100.0);
}

}  // namespace Ip

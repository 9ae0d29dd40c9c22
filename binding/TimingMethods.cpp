// The methods that query timing figures. What the arguments mean is the calculator's affair:
// they go to it in the order of the words.

#include "binding/Call.h"

namespace Ip {

namespace {

// The two KRU jitter methods: input frequency, pin name, three flags, two numbers.
int KruPkToPkJitter(const Call& call, VorkelImp& imp, bool isKruClkgen) {
  Port::StringBase error;
  double jitter = 0.0;
  const bool answered =
      imp.GetKruPkToPkJitter(call.Number(0), call.String(1), isKruClkgen, call.Flag(2),
                             call.Flag(3), call.Flag(4), call.Number(5), call.Number(6), &error,
                             &jitter);
  return call.AnswerQuery(answered, jitter, error);
}

}  // namespace

int VorkelPtrHandle::GetVcoFreq(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 4, "GetVcoFreq");
  if (imp == nullptr) return TCL_ERROR;
  Port::StringBase error;
  double frequency = 0.0;
  const bool answered = imp->GetVcoFreq(call.Number(0), call.Number(1), call.Number(2),
                                        call.Number(3), &error, &frequency);
  return call.AnswerQuery(answered, frequency, error);
}

int VorkelPtrHandle::GetPLLPkToPkJitter(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(*this, 6, "GetPLLPkToPkJitter");
  if (imp == nullptr) return TCL_ERROR;
  Port::StringBase error;
  double jitter = 0.0;
  const bool answered =
      imp->GetPLLPkToPkJitter(call.Number(0), call.Number(1), call.Number(2), call.String(3),
                              call.Number(4), call.Number(5), &error, &jitter);
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
  Port::StringBase error;
  double phaseError = 0.0;
  const bool answered = imp->GetPLLPhaseError(call.Number(0), call.Number(1), call.String(2),
                                              &error, &phaseError);
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
  Port::StringBase error;
  double period = 0.0;
  double phase = 0.0;
  double dutyCycle = 0.0;
  const bool answered = imp->GetKRUPeriodPhaseDutyCycle(
      call.Number(0), call.String(1), call.Flag(2), call.Number(3), call.Number(4),
      call.Number(5), &error, &period, &phase, &dutyCycle);
  return call.AnswerQuery(answered, period, error);
}

int VorkelPtrHandle::GetPLLPeriodPhaseDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  VorkelImp* imp = call.Object(
      *this, 7, "GetPLLPeriodPhaseDutyCycle",
      "Unable to obtain Implementation object for VorkelPtrHandle::GetPllPeriodPhaseDutyCycle");
  if (imp == nullptr) return TCL_ERROR;
  Port::StringBase error;
  double period = 0.0;
  double phase = 0.0;
  double dutyCycle = 0.0;
  const bool answered = imp->GetPLLPeriodPhaseDutyCycle(
      call.Number(0), call.Number(1), call.Number(2), call.Number(3), call.Number(4),
      call.Number(5), call.Number(6), &error, &period, &phase, &dutyCycle);
  return call.AnswerQuery(answered, period, error);
}

int VorkelPtrHandle::GetLatestPhase(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetLatestPhase");
  return imp == nullptr ? TCL_ERROR : call.Answer("%3.3f", imp->GetLatestPhase());
}

int VorkelPtrHandle::GetLatestDutyCycle(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 0, "GetLatestDutyCycle");
  return imp == nullptr ? TCL_ERROR : call.Answer("%3.3f", imp->GetLatestDutyCycle());
}

int VorkelPtrHandle::TSYNCalculateActualPhase(int objc, Words objv, Tcl_Interp* interp) {
  const Call call(objc, objv, interp);
  const VorkelImp* imp = call.Object(*this, 3, "TSYNCalculateActualPhase");
  if (imp == nullptr) return TCL_ERROR;
  const double phase = call.Number(0);
  const double divider = call.Number(1);
  return call.Answer("%3.3f", imp->TSYNCalculateActualPhase(&phase, &divider, call.Flag(2)));
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
  return call.Answer("%3.3f", imp->TSYNCalculateActualDutyCycle(&dutyCycle, &divider) * 100.0);
}

}  // namespace Ip

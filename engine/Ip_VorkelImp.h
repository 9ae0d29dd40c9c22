// The implementation object: one for each script handle.
//
// It holds the device and its limits, the requests, the state of every solver and the host
// objects through which speed data and timing figures are reached. Each file of the engine
// adds the operations of one technique: SpeedData.cpp and LimitLoaders.cpp the device data,
// ListParsers.cpp the requests, pll/ the PLL and TSYN search, kru/ and kru_clkgen/ the KRUs,
// timing/ the timing figures. The state is open to them and to their tests; callers outside
// the engine use the operations.
//
// The engine reports failure by result codes and false returns and throws nothing of its own.
// The calls of an object come from one thread at a time; those of several objects can come from
// several.
#ifndef VORKEL_ENGINE_IP_VORKELIMP_H_
#define VORKEL_ENGINE_IP_VORKELIMP_H_

#include <cstdint>

#include "engine/DeviceLimits.h"
#include "engine/Requests.h"
#include "engine/kru/KruState.h"
#include "engine/pll/PllState.h"
#include "host/Port_StringBase.h"

class Dly_SpeedController;
class PM_PIC;
class Tw_BmCMBCalculator;
struct Tcl_Interp;

namespace Ip {

class VorkelImp {
 public:
  // `interp` is the interpreter for which the object is made; it is only kept.
  explicit VorkelImp(Tcl_Interp* interp);
  virtual ~VorkelImp();
  VorkelImp(const VorkelImp&) = delete;
  VorkelImp& operator=(const VorkelImp&) = delete;

  // --- Device and mode ---------------------------------------------------------------

  // Selects the device by part name. An empty name is ignored. The speed data stay those of
  // the device that was selected when they were first read.
  void SetDevice(const Port::StringBase& name);

  // Low-bandwidth mode limits the PFD frequency by `_maxPfdLowB`.
  void SetLowBandwidth(bool on) { lowBandwidth = on; }

  // --- Requests: engine/ListParsers.cpp ----------------------------------------------

  // Each reads the first `count` numbers of a list separated by blanks into its request list;
  // text that is no number reads as 0. False, with nothing stored, when the text is empty or
  // `count` is outside 1 to MAX_OUTPUTS; false, with the numbers before the end stored, when
  // the list is short. Numbers beyond `count` are ignored.
  bool ParseOutFreqs(int count, const Port::StringBase& text);   // MHz
  bool ParsePhases(int count, const Port::StringBase& text);     // degrees
  bool ParseDutyCycles(int count, const Port::StringBase& text);  // percent

  // --- Speed data: engine/SpeedData.cpp, engine/LimitLoaders.cpp ----------------------

  // True when a speed controller is there, made on first need from the device selected then.
  bool EnsureSpeedController();

  // One value of the device's speed data: MHz, ns or a count, by keyword. False, with the
  // reason issued as a message and `value` untouched, when it cannot be read.
  bool GetSpdKeyValue(Port::StringBase keyword, double* value);
  // The same, for those who keep their keyword.
  bool ReadSpeedData(const Port::StringBase& keyword, double* value);

  // Fill the limits from the speed data. Each stops at the first keyword that cannot be read
  // and returns false; the fields read before it keep their new values.
  bool LoadPllLimits(int prim);  // 1 PLL, 0 TSYN; false for any other
  bool LoadKruLimits();
  bool LoadKruClkgenLimits();

  // --- PLL and TSYN: engine/pll/Driver.cpp --------------------------------------------

  // Finds the configuration with the smallest VCO for `count` output frequencies from the
  // input clocks `inFreq` and `inFreq2` (MHz; 0: no second input). `prim` is 1 for PLL, 0 for
  // TSYN. A result code of Pll::ResultCode; nothing is chosen unless it is kSolved.
  int CalculateMinPowerOutFreqs(const Port::StringBase& outFreqs, double inFreq, double inFreq2,
                                int count, bool preferMaxVco, bool intDiv0Only, int prim,
                                bool verbose);

  // The same for frequencies, phases (degrees) and duty cycles (percent); among several
  // configurations it takes the one whose phases and duty cycles come closest.
  int GetClosestSolution(const Port::StringBase& outFreqs, const Port::StringBase& phases,
                         const Port::StringBase& dutyCycles, double inFreq, double inFreq2,
                         int count, bool preferMaxVco, bool intDiv0Only, int prim, bool verbose);

  // The chosen configuration: engine/pll/ChosenValues.cpp. All answer 0 when none is chosen
  // and for an output n that they do not have.
  double GetChosenVCO() const;  // MHz
  double GetChosenM() const;
  std::int32_t GetChosenD() const;
  double GetChosenDiv0() const;
  std::int32_t GetChosenDivN(int n) const;        // outputs 1 to 6
  double GetChosenOutFreqN(int n) const;          // MHz
  double GetChosenPhaseN(int n) const;            // degrees
  double GetChosenDutyCycleN(int n) const;        // a fraction

  // --- KRU_SP and KRU_CLKGEN: engine/kru/Driver.cpp, engine/kru_clkgen/Driver.cpp -------

  // Finds pins and settings of a KRU_SP for `numOut` output frequencies and phases (degrees)
  // from `inFreq` (MHz). A result code of Kru::ResultCode.
  int KruCalculateActuals(const Port::StringBase& outFreqs, const Port::StringBase& phases,
                          double inFreq, int numOut, bool feedbackUsed, bool verbose);

  // The same for a KRU_CLKGEN. It works with the CLKFX and CLKFXDV limits as they stand, and so
  // never answers kNoSpeedData.
  int KruClkgenCalculateActuals(const Port::StringBase& outFreqs, const Port::StringBase& phases,
                                double inFreq, int numOut, bool verbose);

  // The chosen configuration: engine/kru/ChosenValues.cpp.
  std::int32_t GetKruChosenM() const { return kru._kruChosenM; }
  std::int32_t GetKruChosenD() const { return kru._kruChosenD; }
  bool GetKruChosenDivBy2() const { return kru._kruChosenDivBy2; }
  double GetKruChosenPhaseOffset() const { return kru._kruPhaseOffset; }  // degrees
  int GetKruChosenPhaseShift() const;
  double GetKruChosenClkdv() const { return kru._kruChosenClkdv; }    // CLKDV divide; 0: none
  double GetKruChosenClkfxdv() const { return kru._kruChosenClkdv; }  // DV; the same value
  // The pin of output n; "NONE" outside 0 to 6. Index 6 is the first entry of
  // _kruPinsDivBy2T: scripts read it so.
  Port::StringBase GetKruChosenPinname(int n) const;
  // The frequency of output n (MHz, index 6 as above) from an input frequency in MHz; 0 where
  // there is none.
  double GetKruChosenOutFreqN(double inputFreq, int n) const;

  // --- Timing: engine/timing/ ----------------------------------------------------------

  // Asks the host for the calculator of the device. False, with a message issued, when there
  // is none.
  bool ObtainCalculator();

  // Queries of the host's calculator. It is asked for anew by each; without one, a message is
  // issued, the error text stays empty and the answer is false. The arguments go to it unread
  // but for pin names, and its answer, error text and figure come back as they are.
  bool GetVcoFreq(double a1, double a2, double a3, double a4, Port::StringBase* error,
                  double* frequency);
  bool GetPLLPkToPkJitter(double a1, double a2, double a3, const Port::StringBase& t4, double a5,
                          double a6, Port::StringBase* error, double* jitter);
  bool GetKruPkToPkJitter(double a1, const Port::StringBase& pin, bool isKruClkgen, bool f1,
                          bool f2, bool f3, double a2, double a3, Port::StringBase* error,
                          double* jitter);
  bool GetKRUPhaseError(Port::StringBase* error, double* phaseError);
  bool GetPLLPhaseError(double a1, double a2, const Port::StringBase& t3,
                        Port::StringBase* error, double* phaseError);

  // The period queries keep phase and duty cycle for the accessors below. The phase comes back
  // in degrees: that of a KRU is turned from a fraction of a cycle, and kept truncated to whole
  // degrees; that of a PLL or TSYN stays as the calculator gives it.
  bool GetKRUPeriodPhaseDutyCycle(double a1, const Port::StringBase& pin, bool f1, double a2,
                                  double a3, double a4, Port::StringBase* error, double* period,
                                  double* phase, double* dutyCycle);
  bool GetPLLPeriodPhaseDutyCycle(double a1, double a2, double a3, double a4, double a5,
                                  double a6, double a7, Port::StringBase* error, double* period,
                                  double* phase, double* dutyCycle);

  // What the last successful period query has kept. 0 before one.
  double GetLatestPhase() const { return latestPhase; }
  double GetLatestDutyCycle() const { return latestDutyCycle; }

  // The phase (degrees) or duty cycle (a fraction) that a TSYN output divider makes of a
  // requested phase (degrees) or duty cycle (percent); 0 where there is none. The flag of the
  // phase has no effect.
  double TSYNCalculateActualPhase(const double* phase, const double* divider, bool flag) const;
  double TSYNCalculateActualDutyCycle(const double* dutyCycle, const double* divider) const;

  // --- State --------------------------------------------------------------------------

  Tw_BmCMBCalculator* cmbCalculator = nullptr;   // owned; replaced by every timing query
  Dly_SpeedController* speedController = nullptr;  // of the shared-object registry; not owned
  PM_PIC* pic = nullptr;                         // owned
  Tcl_Interp* interp;
  Port::StringBase partName;
  double latestPhase = 0.0;
  double latestDutyCycle = 0.0;

  PllLimits pllLimits;
  KruLimits kruLimits;
  Requests requests;
  bool lowBandwidth = false;

  Pll::PllState pll;
  KruState kru;

  // The primitive of the current PLL/TSYN run: 1 PLL, 0 TSYN, -1 before the first. One value
  // for all objects, not for each; every solver pass sets it, and the trace prints it. Decisions
  // are made by the run's own (Pll::Run). Each thread has its own, so that runs of several do not
  // meet.
  static constinit thread_local std::int32_t _prim;
};

}  // namespace Ip

#endif  // VORKEL_ENGINE_IP_VORKELIMP_H_

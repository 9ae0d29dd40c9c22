// The limits of a device, as its speed data gives them. Frequencies in MHz.
//
// The defaults are what an object works with until speed data are loaded; a load that fails
// midway has replaced what it has read. The odd figures are meant exactly as written.
#ifndef VORKEL_ENGINE_DEVICELIMITS_H_
#define VORKEL_ENGINE_DEVICELIMITS_H_

namespace Ip {

// PLL and TSYN. One set of fields serves both primitives: a load overwrites them.
struct PllLimits {
  double vcoTarget = 0.0;         // preferred VCO frequency (TSYN)
  double vcoMin = 400.0;          // VCO frequency
  double vcoMax = 1200.0;
  double pfdMin = 10.0;           // frequency at the phase-frequency detector
  double pfdMax = 550.0;
  double _maxPfdLowB = 300.0;     // the same in low-bandwidth mode; only a TSYN load sets it
  double clkoutMin = 3.125;       // output frequency
  double clkoutMax = 375.0;       // on a global clock
  double clkoutMaxIo = 1000.0;    // on an I/O clock (PLL)
  double maxHighLowCount = 64.0;  // high or low time of an output divider, in VCO cycles
};

// KRU_SP and KRU_CLKGEN: the output frequencies of each pin family. "2x" is the maximum with
// the feedback taken from CLK2X.
struct KruLimits {
  double _kruClk0Min = 5.0;  // CLK0 and CLK180
  double _kruClk0Max = 280.112;
  double _kruClk0Max2x = 187.617;
  double _kruClk90Min = 5.0;  // CLK90 and CLK270
  double _kruClk90Max = 200.0;
  double _kruClk90Max2x = 187.617;
  double _kruClk2xMin = 10.0;  // CLK2X and CLK2X180
  double _kruClk2xMax = 374.532;
  double _kruClkdvMin = 0.3125;
  double _kruClkdvMax = 185.874;
  double _kruClkdvMax2x = 125.0;
  double _kruClkfxMin = 5.0;  // CLKFX and CLKFX180
  double _kruClkfxMax = 374.532;
  double _kruClkfxdvMin = 0.156;
  double _kruClkfxdvMax = 187.266;
};

}  // namespace Ip

#endif  // VORKEL_ENGINE_DEVICELIMITS_H_

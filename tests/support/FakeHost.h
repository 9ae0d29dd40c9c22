// A host for tests of the engine: speed data from a map, messages into a list.
//
// It stands in for the bundled host's device personality, speed data, message manager and
// calculator; the string class and the registry are the real ones.
#ifndef VORKEL_TESTS_SUPPORT_FAKEHOST_H_
#define VORKEL_TESTS_SUPPORT_FAKEHOST_H_

#include <functional>
#include <map>
#include <string>
#include <vector>

class Tw_BmCMBCalculator;

struct FakeHost {
  // The host of the process.
  static FakeHost& Instance();

  // Back to no devices, no messages.
  void Reset();

  // The figures of each device, as GetBelDelay returns them. A part name that is not here
  // cannot be created. Controllers look their figures up at every read, so a test may change
  // them under a living object.
  std::map<std::string, std::map<std::string, double>> devices;

  // Parts whose personality can be created but whose controller cannot.
  std::vector<std::string> withoutSpeedData;

  // Run while a personality, a controller or a calculator is made; they may throw.
  std::function<void()> whilePersonalityIsMade;
  std::function<void()> whileControllerIsMade;
  std::function<void()> whileCalculatorIsMade;

  struct Message {
    std::string category, source, revision, text;
    int line = 0;
  };
  std::vector<Message> messages;

  // Every keyword read, in order.
  std::vector<std::string> reads;

  int personalities = 0;  // living PM_PIC objects
  int controllers = 0;    // controllers ever made
  int fillDefaultsCalls = 0;

  // What GetCMBCalculator answers.
  Tw_BmCMBCalculator* calculator = nullptr;
  int calculatorRequests = 0;

  // The texts of all messages.
  std::vector<std::string> MessageTexts() const;
};

// The figure for which GetSpdKeyValue gives `value`: its product with 1e9 is exactly `value`
// where any double's is.
double FigureFor(double value);

// Sets all PLL keywords, TSYN keywords or KRU keywords of a device.
struct FakePll {
  double vcoMin = 400, vcoMax = 1080, clkoutMin = 3.125, clkoutMax = 400, pfdMin = 19,
         pfdMax = 500, maxHighLowCount = 64, clkoutMaxIo = 1080;
};
struct FakeTsyn {
  double vcoMin = 600, vcoMax = 1440, clkoutMin = 4.6875, clkoutMax = 800, pfdMin = 10,
         pfdMax = 500, vcoTarget = 1000, maxHighLowCount = 64, maxPfdLowB = 300;
};
void SetPll(const std::string& part, const FakePll& limits);
void SetTsyn(const std::string& part, const FakeTsyn& limits);

#endif  // VORKEL_TESTS_SUPPORT_FAKEHOST_H_

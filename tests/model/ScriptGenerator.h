// Random scripts: calls as flows make them and calls that are wrong, on several handles that come,
// are renamed and go. The same seed gives the same script on every machine.
#ifndef VORKEL_TESTS_MODEL_SCRIPTGENERATOR_H_
#define VORKEL_TESTS_MODEL_SCRIPTGENERATOR_H_

#include <map>
#include <string>
#include <vector>

#include "tests/compare/Random.h"
#include "tests/compare/RequestGenerator.h"
#include "tests/model/Step.h"

namespace model {

// A device whose limits were drawn beside a request, of which it may lack some.
struct DrawnDevice {
  std::string name;
  compare::Case drawn;
  std::string file;  // its text
};
std::vector<DrawnDevice> DrawDevices(int count, compare::Random& random);

class ScriptGenerator {
 public:
  ScriptGenerator(compare::Random& random, const std::vector<DrawnDevice>& devices)
      : random_(random), devices_(devices) {}

  // The next step. It can be one whose plain search goes far.
  Step Draw();

 private:
  Step Call(Words words) { return {Step::Kind::kCall, DrawHandle(), std::move(words)}; }
  int DrawHandle();
  Words DrawDevice();
  Words DrawLoop();
  Words DrawKru();
  Words DrawChosen();
  Words DrawTiming();
  Words DrawSteps();
  Words DrawWrong();
  std::string DrawFlag();
  std::string DrawIndex();
  std::string DrawNumber();

  compare::Random& random_;
  const std::vector<DrawnDevice>& devices_;
  int last_handle_ = 0;
  std::string last_input_ = "100";
};

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_SCRIPTGENERATOR_H_

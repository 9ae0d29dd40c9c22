// A model of one object of a script: what it answers to each call of its 40 methods, after whatever
// calls came before. Written apart from the engine, over the plain solvers; the timing figures are
// asked of the host's calculator.
#ifndef VORKEL_TESTS_MODEL_OBJECTMODEL_H_
#define VORKEL_TESTS_MODEL_OBJECTMODEL_H_

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "tests/model/HostDevice.h"
#include "tests/plain/plain_kru.h"
#include "tests/plain/plain_pll.h"

namespace model {

using Words = std::vector<std::string>;

// What a call answers.
struct Answer {
  bool is_ok = true;
  std::string text;
  std::string trace;                // on standard output
  std::vector<std::string> errors;  // messages of the engine
  // False: the text is not worked out, only whether it is an error.
  bool is_known = true;
};

class ObjectModel {
 public:
  // The answer to a call: the name of a method and its arguments.
  Answer Call(const Words& words);

  // Whether the plain search of that call would take seconds.
  bool GoesFar(const Words& words) const;

 private:
  struct Method {
    const char* name;
    std::size_t arguments;
    void (ObjectModel::*call)(const Words& words, Answer* answer);
  };
  static const std::vector<Method>& Methods();
  static const Method* Find(const std::string& name);

  // One concern a file: ObjectModel.cpp, LoopCalls.cpp, KruCalls.cpp and TimingCalls.cpp.
  void CallDevice(const Words& words, Answer* answer);
  void CallLoop(const Words& words, Answer* answer);
  void CallKru(const Words& words, Answer* answer);
  void CallTiming(const Words& words, Answer* answer);

  bool Bind();
  std::optional<double> Figure(const std::string& keyword, Answer* answer);
  bool LoadLoopLimits(int primitive, Answer* answer);
  bool LoadKruLimits(Answer* answer);
  bool ReachesLoopLimits(const plain::PllRequest& request) const;
  plain::PllRequest LoopRequest(const Words& words) const;
  void SolveLoop(const Words& words, Answer* answer);
  void SolveKru(const Words& words, Answer* answer);

  std::string part_;
  std::shared_ptr<const HostDevice> device_;  // bound by the first need of it
  bool low_bandwidth_ = false;
  double latest_phase_ = 0.0;
  double latest_duty_ = 0.0;
  plain::PllLimits loop_limits_;
  plain::KruLimits kru_limits_;
  plain::RequestLists lists_;
  plain::PllAnswer loop_;
  plain::KruState kru_;
};

// What the words of a call mean, and how figures are written.
double Number(const std::string& word);
int Count(const std::string& word);
inline bool Flag(const std::string& word) { return word == "true"; }
std::string Written(const char* format, double value);

}  // namespace model

#endif  // VORKEL_TESTS_MODEL_OBJECTMODEL_H_

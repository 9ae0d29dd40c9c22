// The methods by name, the device and its speed data.

#include "tests/model/ObjectModel.h"

#include <array>
#include <cstdio>
#include <cstdlib>

namespace model {

double Number(const std::string& word) { return std::atof(word.c_str()); }

int Count(const std::string& word) {
  return static_cast<int>(std::strtol(word.c_str(), nullptr, 10));
}

std::string Written(const char* format, double value) {
  std::array<char, 512> text;
  std::snprintf(text.data(), text.size(), format, value);
  return text.data();
}

const std::vector<ObjectModel::Method>& ObjectModel::Methods() {
  using M = ObjectModel;
  static const std::vector<Method> methods = {
      {"GetSpdKeyValue", 1, &M::CallDevice},
      {"SetDevice", 1, &M::CallDevice},
      {"SetLowBandwidth", 1, &M::CallDevice},
      {"SetVcoMinThreshold", 1, &M::CallDevice},
      {"GetVcoFreq", 4, &M::CallTiming},
      {"GetPLLPkToPkJitter", 6, &M::CallTiming},
      {"GetKRUPkToPkJitter", 7, &M::CallTiming},
      {"GetKRU_CLKGENPkToPkJitter", 7, &M::CallTiming},
      {"GetPLLPhaseError", 3, &M::CallTiming},
      {"GetKRUPhaseError", 0, &M::CallTiming},
      {"GetKRUPeriodPhaseDutyCycle", 6, &M::CallTiming},
      {"GetPLLPeriodPhaseDutyCycle", 7, &M::CallTiming},
      {"GetLatestPhase", 0, &M::CallTiming},
      {"GetLatestDutyCycle", 0, &M::CallTiming},
      {"TSYNCalculateActualOutFreqs", 7, &M::SolveLoop},
      {"PLLCalculateActualOutFreqs", 7, &M::SolveLoop},
      {"KruCalculateActuals", 6, &M::SolveKru},
      {"KruClkgenCalculateActuals", 5, &M::SolveKru},
      {"GetClosestSolution", 10, &M::SolveLoop},
      {"GetChosenM", 0, &M::CallLoop},
      {"GetChosenMInt", 0, &M::CallLoop},
      {"GetChosenD", 0, &M::CallLoop},
      {"GetChosenDiv0", 0, &M::CallLoop},
      {"GetChosenDiv0Int", 0, &M::CallLoop},
      {"GetChosenDivN", 1, &M::CallLoop},
      {"GetChosenVCO", 0, &M::CallLoop},
      {"GetChosenOutFreqN", 1, &M::CallLoop},
      {"GetChosenPhaseN", 1, &M::CallLoop},
      {"GetChosenDutyCycleN", 1, &M::CallLoop},
      {"GetKruChosenM", 0, &M::CallKru},
      {"GetKruChosenD", 0, &M::CallKru},
      {"GetKruChosenPhaseShift", 0, &M::CallKru},
      {"GetKruChosenPhaseOffset", 0, &M::CallKru},
      {"GetKruChosenClkdv", 0, &M::CallKru},
      {"GetKruChosenClkfxdv", 0, &M::CallKru},
      {"GetKruChosenDivBy2", 0, &M::CallKru},
      {"GetKruChosenPinname", 1, &M::CallKru},
      {"GetKruChosenOutFreqN", 2, &M::CallKru},
      {"TSYNCalculateActualPhase", 3, &M::CallTiming},
      {"TSYNCalculateActualDutyCycle", 3, &M::CallTiming},
  };
  return methods;
}

const ObjectModel::Method* ObjectModel::Find(const std::string& name) {
  for (const Method& method : Methods()) {
    if (name == method.name) return &method;
  }
  return nullptr;
}

Answer ObjectModel::Call(const Words& words) {
  Answer answer;
  if (words.empty()) return {false, "Error: Missing Tcl command.", {}, {}};
  const std::string& name = words.front();
  const Method* const method = Find(name);
  if (method == nullptr) {
    const std::string shown = name.empty() ? "NULL" : name;
    return {false, "Error: Unknown Tcl command \"" + shown + "\".", {}, {}};
  }
  if (words.size() != method->arguments + 1) {
    return {false, name + ": Invalid number of arguments.", {}, {}};
  }
  (this->*method->call)(words, &answer);
  return answer;
}

// The device that is selected at the first need stays.
bool ObjectModel::Bind() {
  if (device_ == nullptr && !part_.empty()) device_ = HostDevice::Find(part_);
  return device_ != nullptr;
}

std::optional<double> ObjectModel::Figure(const std::string& keyword, Answer* answer) {
  const auto fail = [&](const std::string& reason) {
    answer->errors.push_back("Internal GetSpdKeyValue() error -- " + reason);
    return std::nullopt;
  };
  if (keyword.empty()) return fail("keyword is empty");
  if (part_.empty()) return fail("no device was specified yet");
  if (!Bind()) return fail("speedsfile could not be loaded");
  const std::optional<double> figure = device_->Figure(keyword);
  if (!figure) return fail("could not get speedsfile data for key " + keyword);
  return figure;
}

void ObjectModel::CallDevice(const Words& words, Answer* answer) {
  const std::string& argument = words[1];
  if (words[0] == "SetDevice") {
    if (!argument.empty()) part_ = argument;
  } else if (words[0] == "SetLowBandwidth") {
    low_bandwidth_ = Flag(argument);
  } else if (words[0] == "GetSpdKeyValue") {
    const std::optional<double> figure = Figure(argument, answer);
    answer->is_ok = figure.has_value();
    answer->text = figure ? Written("%3.3f", *figure)
                          : "Unable to get value from speedsfile for keyword " + argument;
  }
}

}  // namespace model

// Tested by settings_test.cpp.
#include "planner/read/Settings.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <utility>

#include "planner/read/Letters.h"

namespace planner::read {

namespace {

constexpr std::array<OptionFacts, 10> kOptions = {{
    {"--m", "M", ValueKind::kNumber},
    {"--d", "D", ValueKind::kNumber},
    {"--divide", "LIST", ValueKind::kNumber, true},
    {"--phase-steps", "LIST", ValueKind::kNumber, true},
    {"--set-phase", "LIST", ValueKind::kPhase, true},
    {"--high-times", "LIST", ValueKind::kNumber, true},
    {"--set-duty", "LIST", ValueKind::kDuty, true},
    {"--pins", "LIST", {}},
    {"--divide-by-2", "", {}},
    {"--phase-shift", "N", ValueKind::kNumber},
}};

std::vector<std::string> PinNames(std::string_view text) {
  std::vector<std::string> names;
  for (std::size_t begin = 0; begin <= text.size();) {
    const std::size_t comma = std::min(text.find(',', begin), text.size());
    std::string name(Trimmed(text.substr(begin, comma - begin)));
    for (char& letter : name)
      letter = letter >= 'a' && letter <= 'z' ? static_cast<char>(letter - ('a' - 'A')) : letter;
    names.push_back(std::move(name));
    begin = comma + 1;
  }
  return names;
}

template <typename T>
void Take(const Entry<T>& from, Entry<T>* to) {
  if (from) *to = from;
}

}  // namespace

std::span<const OptionFacts> SettingOptions() { return kOptions; }

const OptionFacts* FindSettingOption(std::string_view name) {
  for (const OptionFacts& facts : kOptions) {
    if (facts.name == name) return &facts;
  }
  return nullptr;
}

SettingsDraft ReadSettingOptions(std::span<const Option> options, Mistakes* mistakes) {
  SettingsDraft draft;
  const std::pair<std::string_view, Entry<Rational> SettingsDraft::*> numbers[] = {
      {"--m", &SettingsDraft::m},
      {"--d", &SettingsDraft::d},
      {"--phase-shift", &SettingsDraft::phase_shift}};
  const std::pair<std::string_view, Entry<Values> SettingsDraft::*> lists[] = {
      {"--divide", &SettingsDraft::dividers},
      {"--phase-steps", &SettingsDraft::phase_steps},
      {"--set-phase", &SettingsDraft::phases},
      {"--high-times", &SettingsDraft::high_times},
      {"--set-duty", &SettingsDraft::duties}};
  for (const Option& option : options) {
    const OptionFacts* const facts = FindSettingOption(option.name);
    if (facts == nullptr) continue;
    Place place;
    place.entry = facts->name;
    for (const auto& [name, member] : numbers) {
      if (name != facts->name) continue;
      const auto value = ReadValue(option.value, *facts->kind, place, mistakes);
      if (value) draft.*member = {*value, place, option.value};
    }
    for (const auto& [name, member] : lists) {
      if (name != facts->name) continue;
      auto values = ReadValues(option.value, *facts->kind, place, true, mistakes);
      if (values) draft.*member = {*std::move(values), place, option.value};
    }
    if (facts->name == "--pins") draft.pins = {PinNames(option.value), place, option.value};
    if (facts->name == "--divide-by-2") {
      draft.divide_by_2 = {option.value != "0" && !IsSameWord(option.value, "false"), place, ""};
    }
  }
  return draft;
}

SettingsDraft Over(const SettingsDraft& options, const SettingsDraft& file) {
  SettingsDraft all = file;
  // Two ways to say one thing: of the file neither counts beside one of them.
  if (options.phase_steps || options.phases) all.phase_steps.reset();
  if (options.high_times || options.duties) all.high_times.reset();
  Take(options.primitive, &all.primitive);
  Take(options.bandwidth, &all.bandwidth);
  Take(options.feedback, &all.feedback);
  Take(options.m, &all.m);
  Take(options.d, &all.d);
  Take(options.dividers, &all.dividers);
  Take(options.phase_steps, &all.phase_steps);
  Take(options.phases, &all.phases);
  Take(options.high_times, &all.high_times);
  Take(options.duties, &all.duties);
  Take(options.pins, &all.pins);
  Take(options.divide_by_2, &all.divide_by_2);
  Take(options.phase_shift, &all.phase_shift);
  return all;
}

Primitive PrimitiveOf(const Draft& draft, const SettingsDraft& settings, const Device& device) {
  if (draft.primitive && draft.primitive->value) return *draft.primitive->value;
  if (settings.primitive) return settings.primitive->value;
  if (settings.pins) {
    const std::vector<std::string>& pins = settings.pins->value;
    const bool has_divided = std::find(pins.begin(), pins.end(), "CLKFXDV") != pins.end();
    return has_divided ? Primitive::kKruClkgen : Primitive::kKruSp;
  }
  return device.Has(Primitive::kTsyn) ? Primitive::kTsyn : Primitive::kPll;
}

}  // namespace planner::read

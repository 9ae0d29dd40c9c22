// The names that options and files have for what is one of several.
#ifndef VORKEL_PLANNER_READ_NAMES_H_
#define VORKEL_PLANNER_READ_NAMES_H_

#include <optional>
#include <string_view>

#include "planner/read/Draft.h"

namespace planner::read {

// Each reads a name, in any case; what is none is added to `mistakes`. In the entry, the place and
// the name are kept.
Entry<std::optional<Primitive>> ReadPrimitive(std::string_view name, const Place& place,
                                              Mistakes* mistakes);  // "auto": nothing
Entry<Bandwidth> ReadBandwidth(std::string_view name, const Place& place, Mistakes* mistakes);
Entry<Rank> ReadRank(std::string_view name, const Place& place, Mistakes* mistakes);

std::string_view NameOf(Rank rank);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_NAMES_H_

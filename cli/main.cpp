// The command line: finds the settings of a device's clock primitives.
#include <string>
#include <vector>

#include "cli/Output.h"
#include "cli/Run.h"
#include "cli/Setting.h"

int main(int count, char** words) {
  cli::PrepareStreams();
  return cli::RunWords(std::vector<std::string>(words + (count > 0 ? 1 : 0), words + count),
                       cli::SettingOfProcess());
}

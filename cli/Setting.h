// Where the program runs: what it is called, where it stands, and what its output goes to.
#ifndef VORKEL_CLI_SETTING_H_
#define VORKEL_CLI_SETTING_H_

#include <string>
#include <vector>

namespace cli {

struct Setting {
  std::string program = "./vorkel";         // how it was called, as it can be pasted into a shell
  std::string folder;                       // of the executable file
  std::vector<std::string> device_folders;  // of VORKEL_DEVICES, as they stand there
  bool out_has_colour = false;              // standard output is a terminal that shows it
  int out_width = 80;                       // columns of standard output
  int err_width = 80;
};

// As the environment and the streams of this process say.
Setting SettingOfProcess();

}  // namespace cli

#endif  // VORKEL_CLI_SETTING_H_

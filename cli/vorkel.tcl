# The command line: finds the settings of a device's clock primitives.

apply {{} {
  # Joining a name to the script before normalizing follows a link to the script itself.
  set folder [file dirname [file dirname [file normalize [file join [info script] _]]]]
  lappend ::auto_path [file join $folder lib]
  package require vorkel::main
  exit [::vorkel::main::run $::argv]
}}

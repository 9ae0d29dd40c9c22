# Colour for a terminal that shows it. A file, a pipe and a terminal whose user has set NO_COLOR
# get plain text.

package provide vorkel::colour 1.1

namespace eval ::vorkel::colour {
  # The control sequence for each role, by the names of the terminal package.
  variable roles {heading {bold} off {fgred bold} good {fggreen} note {fgyellow}}
  # Whether to paint; "" before it is known.
  variable wanted ""
}

# Whether a channel is a terminal: only those have the settings of a serial line.
proc ::vorkel::colour::isTerminal {channel} {
  return [expr {![catch {fconfigure $channel -mode}]}]
}

# A text in the colour of its role, on the terminal of standard output.
proc ::vorkel::colour::paint {role text} {
  variable roles
  if {$text eq "" || ![Wanted]} {
    return $text
  }
  package require term::ansi::code::ctrl
  set sequence ""
  foreach attribute [dict get $roles $role] {
    append sequence [::term::ansi::code::ctrl::sda_$attribute]
  }
  return $sequence$text[::term::ansi::code::ctrl::sda_reset]
}

# From here on there is no colour, wherever standard output goes.
proc ::vorkel::colour::off {} {
  variable wanted
  set wanted 0
}

proc ::vorkel::colour::Wanted {} {
  variable wanted
  if {$wanted eq ""} {
    set plain [expr {[info exists ::env(NO_COLOR)] && $::env(NO_COLOR) ne ""}]
    set dumb [expr {![info exists ::env(TERM)] || $::env(TERM) in {"" dumb}}]
    set wanted [expr {!$plain && !$dumb && [isTerminal stdout]}]
  }
  return $wanted
}

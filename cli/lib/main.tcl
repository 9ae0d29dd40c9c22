# Runs a command of the program: its words in, text on standard output, an exit status back.

package provide vorkel::main 1.1
package require vorkel::devices 1.1
package require vorkel::help 1.1
package require vorkel::synthesis 1.1

namespace eval ::vorkel::main {
  variable version 1.1
  variable commands {
    tsyn      {::vorkel::synthesis::run TSYN}
    pll       {::vorkel::synthesis::run PLL}
    kru       {::vorkel::synthesis::run KRU_SP}
    clkgen    {::vorkel::synthesis::run KRU_CLKGEN}
    devices   ::vorkel::devices::run
    help      ::vorkel::help::run
    --help    ::vorkel::help::run
    -h        ::vorkel::help::run
    --version ::vorkel::main::Version
  }
  variable solved 0
  variable unsolved 1
  variable wrong_usage 2
  variable failed 3
}

# Runs the command that the words are, says on standard error what went wrong, and answers
# the exit status. A reader of standard output that has gone away is no failure.
proc ::vorkel::main::run {words} {
  variable solved
  variable unsolved
  variable wrong_usage
  variable failed
  try {
    set text [Dispatch $words]
    puts -nonewline $text
    flush stdout
    return $solved
  } trap {POSIX EPIPE} {} {
    return $solved
  } trap {VORKEL UNSOLVED} {sentence} {
    Complain $sentence
    return $unsolved
  } trap {VORKEL USAGE} {reason} {
    Complain "vorkel: $reason\n[::vorkel::help::usage [lindex $words 0]]"
    return $wrong_usage
  } on error {reason} {
    Complain "vorkel: $reason"
    return $failed
  }
}

# The text that a command answers. Without words that is the help.
proc ::vorkel::main::Dispatch {words} {
  variable commands
  if {[llength $words] == 0} {
    return [::vorkel::help::run {}]
  }
  set arguments [lassign $words command]
  if {![dict exists $commands $command]} {
    set kind [expr {[string match -* $command] ? "option" : "command"}]
    throw {VORKEL USAGE} "unknown $kind \"$command\""
  }
  if {"--help" in $arguments && ![string match -* $command]} {
    return [::vorkel::help::run [list $command]]
  }
  return [{*}[dict get $commands $command] $arguments]
}

proc ::vorkel::main::Version {words} {
  variable version
  if {[llength $words] > 0} {
    throw {VORKEL USAGE} "unexpected word \"[lindex $words 0]\""
  }
  return "vorkel $version\n"
}

# Nobody may be listening on standard error either.
proc ::vorkel::main::Complain {text} {
  catch {puts stderr $text}
}

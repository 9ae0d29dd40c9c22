# Runs a command of the program: its words in, text on standard output, an exit status back.

package provide vorkel::main 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1

namespace eval ::vorkel::main {
  variable version 1.1
  # For each command its package and what is called with its words: it writes what it has to say
  # and answers the exit status.
  variable commands {
    plan      {plan ::vorkel::plan::run}
    compare   {plan ::vorkel::plan::compare}
    best      {best ::vorkel::best::run}
    explain   {explain ::vorkel::explain::run}
    tsyn      {synthesis ::vorkel::synthesis::run TSYN}
    pll       {synthesis ::vorkel::synthesis::run PLL}
    kru       {synthesis ::vorkel::synthesis::run KRU_SP}
    clkgen    {synthesis ::vorkel::synthesis::run KRU_CLKGEN}
    devices   {devices ::vorkel::main::Show ::vorkel::devices::run}
    check     {check ::vorkel::check::run}
    help      {help ::vorkel::main::Show ::vorkel::help::run}
    --help    {help ::vorkel::main::Show ::vorkel::help::run}
    -h        {help ::vorkel::main::Show ::vorkel::help::run}
    version   {help ::vorkel::main::Show ::vorkel::main::Version}
    --version {help ::vorkel::main::Show ::vorkel::main::Version}
  }
  variable done 0
  variable unsolved 1
  variable wrong_usage 2
  variable unwritten 2
  variable failed 4
}

# Runs the command that the words are, says on standard error what went wrong, and answers
# the exit status. 3 is for answers that are not as asked for (see answer.tcl).
proc ::vorkel::main::run {words} {
  variable unsolved
  variable wrong_usage
  variable unwritten
  variable failed
  try {
    return [Dispatch $words]
  } trap {VORKEL UNSOLVED} {sentence} {
    Complain $sentence
    return $unsolved
  } trap {VORKEL USAGE FILE} {reason} {
    # The words were right: how they are used is no help.
    Complain "vorkel: $reason"
    return $wrong_usage
  } trap {VORKEL USAGE} {reason} {
    package require vorkel::help 1.1
    Complain "vorkel: $reason\n[::vorkel::help::usage [lindex $words 0]]"
    return $wrong_usage
  } trap {VORKEL UNWRITTEN} {reason} {
    Complain "vorkel: $reason"
    return $unwritten
  } on error {reason} {
    Complain "vorkel: $reason"
    return $failed
  }
}

# Runs a command. Without words that is the help.
proc ::vorkel::main::Dispatch {words} {
  variable commands
  if {[llength $words] == 0} {
    set words help
  }
  set arguments [lassign $words command]
  if {![dict exists $commands $command]} {
    package require vorkel::command_options 1.1
    set name [regsub {=.*$} $command {}]
    if {[llength [::vorkel::command_options::takers $name]] > 0} {
      throw {VORKEL USAGE} "a command must come before $name, such as plan"
    }
    set kind [expr {[string match -* $command] ? "option" : "command"}]
    throw {VORKEL USAGE} "unknown $kind\
      \"[::vorkel::options::shown $command]\"[::vorkel::options::nearest $command \
      [dict keys $commands]]"
  }
  if {("--help" in $arguments || "-h" in $arguments) && ![string match -* $command]} {
    set arguments [list $command]
    set command help
  }
  set ::vorkel::options::command $command
  set call [lassign [dict get $commands $command] package]
  package require vorkel::$package 1.1
  return [{*}$call $arguments]
}

# Writes the text that a command answers.
proc ::vorkel::main::Show {call words} {
  variable done
  ::vorkel::output::write [{*}$call $words]
  return $done
}

proc ::vorkel::main::Version {words} {
  variable version
  ::vorkel::options::operands $words 0
  return "vorkel $version\n"
}

# Nobody may be listening on standard error either. Names of files and devices can have any letter.
proc ::vorkel::main::Complain {text} {
  catch {puts stderr [::vorkel::options::escaped $text "" \n]}
}

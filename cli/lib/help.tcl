# What the program says about its own use.

package provide vorkel::help 1.1
package require vorkel::catalogue 1.1
package require vorkel::request 1.1

namespace eval ::vorkel::help {
  # Each command with its arguments and what it does.
  variable commands {
    tsyn    {--in F[,F2] --out LIST [OPTION...]}  "find the settings of a TSYN"
    pll     {--in F[,F2] --out LIST [OPTION...]}  "find the settings of a PLL"
    devices {[NAME]}                              "list the devices, or all limits of one"
    help    {[COMMAND]}                           "show this help"
  }
  # An exact solution: 27 MHz times 33 is 891 MHz, of which all three are whole parts.
  variable example {tsyn --in 27 --out 148.5,74.25,27}
  variable solvers {tsyn pll}
}

# How the program was called, as it can be pasted into a shell.
proc ::vorkel::help::Program {} {
  if {[info exists ::env(VORKEL_PROGRAM)] && $::env(VORKEL_PROGRAM) ne ""} {
    return $::env(VORKEL_PROGRAM)
  }
  return ./vorkel
}

# The usage line for a command; for none, or for one that there is not, that of the program.
proc ::vorkel::help::usage {{command ""}} {
  variable commands
  foreach {name arguments description} $commands {
    if {$name eq $command} {
      return "usage: [Program] $name $arguments"
    }
  }
  return "usage: [Program] COMMAND \[OPTION...\], or [Program] help"
}

# The help of the command help: for the whole program or for one command.
proc ::vorkel::help::run {words} {
  variable commands
  switch -- [llength $words] {
    0 { return [All] }
    1 { return [One [lindex $words 0]] }
  }
  throw {VORKEL USAGE} "unexpected word \"[lindex $words 1]\""
}

proc ::vorkel::help::All {} {
  variable commands
  variable example
  set text "usage: [Program] COMMAND \[OPTION...\]\n\n"
  append text "Finds clock settings for the PLL or TSYN of a device: VCO, M, D and dividers.\n\n"
  append text "Commands:\n"
  foreach {name arguments description} $commands {
    append text [Line $name $description]
  }
  append text \n [Options] \n
  append text "Exit status:\n"
  foreach {status meaning} {
    0 "solved, or shown what was asked for"
    1 "there is no configuration; the reason is on standard error"
    2 "wrong usage, or a device whose data cannot be read"
    3 "the program itself failed"
  } {
    append text [Line $status $meaning]
  }
  append text "\nExample:\n  [Program] $example\n"
  return $text
}

proc ::vorkel::help::One {command} {
  variable commands
  variable solvers
  foreach {name arguments description} $commands {
    if {$name eq $command} {
      set text "[usage $command]\n\n[string totitle $description 0 0].\n"
      if {$command in $solvers} {
        append text \n [Options]
      }
      return $text
    }
  }
  throw {VORKEL USAGE} "unknown command \"$command\""
}

proc ::vorkel::help::Options {} {
  variable solvers
  set text "Options of [join $solvers { and }] (MHz, degrees, percent; commas between numbers):\n"
  foreach {name placeholder description} $::vorkel::request::options {
    append text [Line [string trimright "$name $placeholder"] $description]
  }
  append text [Line "" "Without --device: $::vorkel::catalogue::defaultPart."]
  return $text
}

proc ::vorkel::help::Line {label text} {
  return [format "  %-18s%s\n" $label $text]
}

# What the program says about its own use.

package provide vorkel::help 1.1
package require vorkel::catalogue 1.1
package require vorkel::request 1.1

namespace eval ::vorkel::help {
  # Each command with its arguments and what it does.
  variable commands {
    tsyn    {--in F[,F2] --out LIST [OPTION...]}  "find the settings of a TSYN"
    pll     {--in F[,F2] --out LIST [OPTION...]}  "find the settings of a PLL"
    kru     {--in F --out LIST [OPTION...]}       "find the settings of a KRU_SP"
    clkgen  {--in F --out LIST [OPTION...]}       "find the settings of a KRU_CLKGEN"
    devices {[NAME]}                              "list the devices, or all limits of one"
    help    {[COMMAND]}                           "show this help"
  }
  # The primitives of the commands that solve.
  variable primitives {tsyn TSYN pll PLL kru KRU_SP clkgen KRU_CLKGEN}
  # Words that have an exact solution: 27 MHz times 33 is 891 MHz, of which all three are whole
  # parts; 100 MHz times 6 is 600 MHz, and 0 and 90 degrees are steps of its dividers; half of
  # 100 MHz, doubled, as it is and times 3; 100 MHz times 3 / 2, as it is and halved.
  variable examples {
    tsyn   {--in 27 --out 148.5,74.25,27}
    pll    {--in 100 --out 200,100 --phase 0,90}
    kru    {--in 100 --out 100,50,150 --phase 0,180,0 --feedback}
    clkgen {--in 100 --out 150,75}
  }
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
  switch -- [llength $words] {
    0 { return [All] }
    1 { return [One [lindex $words 0]] }
  }
  throw {VORKEL USAGE} "unexpected word \"[lindex $words 1]\""
}

proc ::vorkel::help::All {} {
  variable commands
  variable examples
  set text "usage: [Program] COMMAND \[OPTION...\]\n\n"
  append text "Finds the settings of a device's clock primitives: VCO, M, D, dividers and pins,\n"
  append text "with the jitter and the phase error that they have.\n\nCommands:\n"
  foreach {name arguments description} $commands {
    append text [Line $name $description]
  }
  append text \n [Options {tsyn pll} TSYN] \n [Options {kru clkgen} KRU_SP] \n
  append text "Exit status:\n"
  foreach {status meaning} {
    0 "solved, or shown what was asked for"
    1 "there is no configuration; the reason is on standard error"
    2 "wrong usage, or a device whose data cannot be read"
    3 "the program itself failed"
  } {
    append text [Line $status $meaning]
  }
  append text "\nExamples:\n"
  dict for {command words} $examples {
    append text "  [Program] $command $words\n"
  }
  return $text
}

proc ::vorkel::help::One {command} {
  variable commands
  variable primitives
  variable examples
  foreach {name arguments description} $commands {
    if {$name eq $command} {
      set text "[usage $command]\n\n[string totitle $description 0 0].\n"
      if {[dict exists $primitives $command]} {
        append text \n [Options $command [dict get $primitives $command]]
        append text "\nExample:\n  [Program] $command [dict get $examples $command]\n"
      }
      return $text
    }
  }
  throw {VORKEL USAGE} "unknown command \"$command\""
}

# The options of commands, which are those for a primitive.
proc ::vorkel::help::Options {commands primitive} {
  set text "Options of [join $commands { and }] (MHz, degrees, percent, ps; commas between"
  append text " numbers):\n"
  foreach {name placeholder description} [::vorkel::request::optionsOf $primitive] {
    append text [Line [string trimright "$name $placeholder"] $description]
  }
  append text [Line "" "Without --device: $::vorkel::catalogue::defaultPart."]
  return $text
}

proc ::vorkel::help::Line {label text} {
  return [format "  %-18s%s\n" $label $text]
}

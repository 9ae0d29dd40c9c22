# What the program says about its own use.

package provide vorkel::help 1.1
package require vorkel::catalogue 1.1
package require vorkel::request 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::help {
  # Each command with its arguments and what it does.
  variable commands {
    plan    {--in F[,F2] --out LIST [OPTION...]}  "find the primitive that serves best, and say why"
    compare {--in F[,F2] --out LIST [OPTION...]}  "show what all primitives have to offer"
    best    {--in F[,F2] --out LIST [OPTION...]}  "search all settings of a PLL or TSYN there are"
    explain {--in F[,F2] --out LIST [OPTION...]}  "say why a request fails, and what would work"
    tsyn    {--in F[,F2] --out LIST [OPTION...]}  "find the settings of a TSYN"
    pll     {--in F[,F2] --out LIST [OPTION...]}  "find the settings of a PLL"
    kru     {--in F --out LIST [OPTION...]}       "find the settings of a KRU_SP"
    clkgen  {--in F --out LIST [OPTION...]}       "find the settings of a KRU_CLKGEN"
    devices {[NAME]}                              "list the devices, or all limits of one"
    check   {FILE}                                "say what is wrong with a device file"
    help    {[COMMAND]}                           "show this help"
    version {}                                    "show the version"
  }
  # The primitives of the commands that solve for one, and the commands that take any.
  variable primitives {tsyn TSYN pll PLL kru KRU_SP clkgen KRU_CLKGEN}
  variable planners {plan compare best explain}
  # Words that can be pasted. The first two have an exact solution: 27 MHz times 33 is 891 MHz, of
  # which all three are whole parts. 100 MHz times 6 is 600 MHz, and 0 and 90 degrees are steps of
  # its dividers; half of 100 MHz, doubled, as it is and times 3; 100 MHz times 3 / 2, as it is
  # and halved. No VCO makes 148.5 and 27 MHz of 100 MHz.
  variable examples {
    plan    {--in 27MHz --out 148.5,74.25,27}
    compare {--in 25 --out 125,62.5,25}
    best    {--in 100 --out 148.5,74.25,27}
    explain {--in 100 --out 333 --phase 90deg}
    tsyn    {--in 27 --out 148.5,74.25,27}
    pll     {--in 100 --out 200,100 --phase 0,90}
    kru     {--in 100 --out 100,50,150 --phase 0,180,0 --feedback}
    clkgen  {--in 100 --out 150,75}
    devices {vk40}
    check   {devices/vk40.toml}
    help    {plan}
    version {}
  }
  # The commands whose examples the whole help shows.
  variable shown {plan compare best explain tsyn pll kru clkgen}
  variable values [join {
    {Values: 148.5, 148.5MHz, 100/3 or 8ns (MHz when nothing is said); 90 or 90deg;}
    {50 or 50%; 50 or 50ps; 100 or 100ppm. Commas between the entries of a list.}
  } \n]
}

# How the program was called, as it can be pasted into a shell.
proc ::vorkel::help::Program {} {
  if {[info exists ::env(VORKEL_PROGRAM)] && $::env(VORKEL_PROGRAM) ne ""} {
    return $::env(VORKEL_PROGRAM)
  }
  return ./vorkel
}

# A call of the program, as it can be pasted into a shell.
proc ::vorkel::help::command {name words} {
  set quoted [lmap word $words {
    if {![regexp {^[-A-Za-z0-9_./,=:%+@]+$} $word]} {
      set word '[string map {' '\\''} $word]'
    }
    set word
  }]
  return [join [list [Program] $name {*}$quoted]]
}

# The usage line for a command; for none, or for one that there is not, that of the program.
proc ::vorkel::help::usage {{command ""}} {
  variable commands
  foreach {name arguments description} $commands {
    if {$name eq $command} {
      return [string trimright "usage: [Program] $name $arguments"]
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
  variable shown
  variable values
  set text "usage: [Program] COMMAND \[OPTION...\]\n\n"
  append text "Plans clocks: finds the settings of a device's clock primitives, VCO, M, D,\n"
  append text "dividers and pins, with their errors and their jitter.\n\nCommands:\n"
  foreach {name arguments description} $commands {
    append text [Line $name $description]
  }
  append text "\nOptions of plan and compare:\n" [Options $::vorkel::request::options] \
    [Line --trace "tsyn, pll, kru, clkgen: print the steps of the search first"] [Default]
  append text "\nThe other commands have most of them; [Program] help COMMAND tells.\n$values\n"
  append text "\nExit status:\n"
  foreach {status meaning} {
    0 "solved, or shown what was asked for"
    1 "there is no configuration; the reason is on standard error"
    2 "wrong usage, or a file that cannot be read or written"
    3 "solved, but something is outside its tolerance or range"
    4 "the program itself failed"
  } {
    append text [Line $status $meaning]
  }
  append text "\nExamples:\n"
  foreach command $shown {
    append text "  [Program] $command [dict get $examples $command]\n"
  }
  return $text
}

proc ::vorkel::help::One {command} {
  variable commands
  variable examples
  variable values
  foreach {name arguments description} $commands {
    if {$name ne $command} continue
    set text "[usage $command]\n\n[string totitle $description 0 0].\n"
    set options [OptionsOf $command]
    if {[llength $options] > 0} {
      append text "\nOptions:\n" [Options $options]
      if {"--device" in $options} {
        append text [Default] \n $values \n
      }
    }
    append text "\nExample:\n" \
      [string trimright "  [Program] $command [dict get $examples $command]"] \n
    return $text
  }
  package require vorkel::options 1.1
  throw {VORKEL USAGE} "unknown command \"$command\"[::vorkel::options::nearest $command \
    [lmap {name arguments description} $commands {set name}]]"
}

# The options of a command (see options.tcl). The planners have all of a request, and what stands
# in their variable `options`.
proc ::vorkel::help::OptionsOf {command} {
  variable primitives
  variable planners
  if {[dict exists $primitives $command]} {
    return [::vorkel::request::optionsOf [dict get $primitives $command]]
  }
  if {$command ni $planners} {
    return {}
  }
  set own {}
  if {[llength [package versions vorkel::$command]] > 0} {
    package require vorkel::$command 1.1
    if {[info exists ::vorkel::${command}::options]} {
      set own [set ::vorkel::${command}::options]
    }
  }
  return [concat $::vorkel::request::options $own]
}

proc ::vorkel::help::Options {table} {
  set text ""
  foreach {name placeholder description} $table {
    append text [Line [string trimright "$name $placeholder"] $description]
  }
  return $text
}

proc ::vorkel::help::Default {} {
  return [Line "" "Without --device: $::vorkel::catalogue::defaultPart."]
}

proc ::vorkel::help::Line {label text} {
  return [format "  %-17s %s\n" $label $text]
}

# What the program says about its own use.

package provide vorkel::help 1.1
package require vorkel::command_options 1.1
package require vorkel::options 1.1
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
  # Words that can be pasted. 27 MHz times 33 is 891 MHz, of which 148.5, 74.25 and 27 MHz are whole
  # parts; 25 MHz times 20 is 500 MHz, of which 125, 62.5 and 25 MHz are. 100 MHz times 6 is 600
  # MHz, and 0 and 90 degrees are steps of its dividers; half of 100 MHz, doubled, as it is and
  # times 3; 100 MHz times 3 / 2, as it is and halved. Of 100 MHz no VCO has both 148.5 and 27 MHz
  # as whole parts, and there is no 333 MHz with a phase.
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
  # How values are written, with the option that a command has for them.
  variable values {
    --in        frequencies "148.5, 148.5MHz, 100/3, or 8ns for a period; MHz without a unit"
    --phase     phases "90, 90deg, -45; degrees without a unit"
    --duty      {duty cycles} "50, 50%"
    --input-jitter jitter "50, 50ps, 0.05ns; ps without a unit"
    --tolerance tolerance "100, 100ppm, 0.01%; ppm without a unit"
    --in        lists
      "each entry has a unit of its own or none: 24,27,33.3MHz are 24, 27 and 33.3 MHz. One\
      without a unit beside one that is not in MHz, as in 8,16ns, is refused, because 8 could be\
      meant in ns; write 8ns,16ns."
  }
  # What else there is to say of a command.
  variable remarks {
    explain
      "The exit status is 0 also when the request is not possible: an explanation is what was\
      asked for."
    best
      "KRU_SP and KRU_CLKGEN have no such settings to search; plan and compare ask them."
    devices
      "NAME is a device, or a part name with package and grade; the beginning is enough where only\
      one goes on like it."
    check
      "FILE is named DEVICE.toml. Mistakes are on standard error, with line and column, and the\
      exit status is 2. Missing keywords and limits that contradict each other are no mistakes:\
      they are reported with exit status 0."
  }
  variable statuses {
    0 "solved, or shown what was asked for; explain: also what is not possible"
    1 "there is no configuration; the reason is on standard error"
    2 "wrong usage, or a file or standard output that cannot be read or written"
    3 "solved, but something is outside its tolerance or range"
    4 "the program itself failed"
    5 "it could not be set up: packages cannot be installed, or the build fails"
  }
}

# How the program was called, as it can be pasted into a shell.
proc ::vorkel::help::Program {} {
  if {[info exists ::env(VORKEL_PROGRAM)] && $::env(VORKEL_PROGRAM) ne ""} {
    return $::env(VORKEL_PROGRAM)
  }
  return ./vorkel
}

# A call of a command, as it can be pasted into a shell, with those of the words of another
# command that it takes.
proc ::vorkel::help::command {name words} {
  set quoted [lmap word [::vorkel::command_options::kept $name $words] {
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
  set operands [::vorkel::options::operands $words 1]
  if {[llength $operands] == 0} {
    return [All]
  }
  return [One [lindex $operands 0]]
}

proc ::vorkel::help::All {} {
  variable commands
  variable examples
  variable shown
  variable statuses
  set text "usage: [Program] COMMAND \[OPTION...\]\n\n"
  append text "Plans clocks: finds the settings of a device's clock primitives, VCO, M, D,\n"
  append text "dividers and pins, with their errors and their jitter.\n\n"
  append text [Section Commands [lmap {name arguments description} $commands {
    list $name $description
  }]]
  set options [::vorkel::command_options::of plan]
  append text \n [Section "Options of plan" [Options $options]]
  append text \n [Section "Options of other commands" [Options [Others $options]]]
  append text "\n[Program] help COMMAND lists exactly those that a command takes.\n"
  append text \n [Values $options]
  append text \n [Section "Exit status" [lmap {status meaning} $statuses {list $status $meaning}]]
  append text "\nExamples:\n"
  foreach command $shown {
    append text "  [Program] $command [dict get $examples $command]\n"
  }
  return $text
}

# The options that other commands have beside those of a table, with the commands.
proc ::vorkel::help::Others {table} {
  variable commands
  set known [lmap {name placeholder description} $table {set name}]
  set others {}
  foreach {command arguments about} $commands {
    foreach {name placeholder description} [::vorkel::command_options::of $command] {
      if {$name ni $known} {
        lappend known $name
        lappend others $name $placeholder \
          "[join [::vorkel::command_options::takers $name] {, }]: $description"
      }
    }
  }
  return $others
}

proc ::vorkel::help::One {command} {
  variable commands
  variable examples
  variable remarks
  foreach {name arguments description} $commands {
    if {$name ne $command} continue
    set text "[usage $command]\n\n[string totitle $description 0 0].\n"
    set options [::vorkel::command_options::of $command]
    if {[llength $options] > 0} {
      append text \n [Section Options [Options $options]] \n [Values $options]
    }
    if {[dict exists $remarks $command]} {
      append text \n [::vorkel::table::paragraph [dict get $remarks $command]]
    }
    append text "\nExample:\n" \
      [string trimright "  [Program] $command [dict get $examples $command]"] \n
    return $text
  }
  throw {VORKEL USAGE} "unknown command\
    \"[::vorkel::options::shown $command]\"[::vorkel::options::nearest $command \
    [lmap {name arguments description} $commands {set name}]]"
}

# Options as lines of a section.
proc ::vorkel::help::Options {table} {
  return [lmap {name placeholder description} $table {
    list [string trimright "$name $placeholder"] $description
  }]
}

# How the values of some options are written.
proc ::vorkel::help::Values {options} {
  variable values
  set names [lmap {name placeholder description} $options {set name}]
  set lines {}
  foreach {option kind description} $values {
    if {$option in $names} {
      lappend lines [list $kind $description]
    }
  }
  return [Section Values $lines]
}

proc ::vorkel::help::Section {heading lines} {
  return "$heading:\n[::vorkel::table::described $lines]"
}

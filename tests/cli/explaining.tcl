# What the tests of explain share: devices, and what an explanation says.

source [file join [file dirname [info script]] support.tcl]
unset -nocomplain env(VORKEL_PROGRAM)
lappend auto_path [file join $::cli::checkout cli lib]
set env(VORKEL_DEVICES) $::cli::scratch/devices:[file join $::cli::folder devices]
package require vorkel::explain
package require vorkel::answer
package require vorkel::options

# A device like round with other limits: keywords and values, for all grades.
proc device {name args} {
  set text [::cli::contents [file join $::cli::folder devices round.toml]]
  regsub {device = "round"} $text "device = \"$name\"" text
  dict for {keyword value} $args {
    if {![regsub -all -line "^$keyword = .*\$" $text "$keyword = $value" text]} {
      error "round has no $keyword"
    }
  }
  ::cli::write devices/$name.toml $text
}

device slow CLKPFD_FREQ_MIN 1
device narrow VCOCLK_FREQ_MIN 900 CLKOUT_FREQ_MAX_GCLK 800
device deep CLKOUT_FREQ_MIN_GCLK 1
device square D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD 6.25

# The explanation, with its paragraphs in one line each.
proc explain {args} {
  return [explainOf round {*}$args]
}

# Only another device.
proc explainOf {device args} {
  return [::cli::joined [::cli::output explain --device $device {*}$args]]
}

# The limits that a text names: for each primitive and outputs a list of these and the limit.
proc limits {text} {
  set limits {}
  foreach line [split $text \n] {
    if {[regexp {^([A-Z_]+(?:, outputs? [0-9, and]+)?): ([A-Za-z ]+): } $line -> whose limit]} {
      lappend limits $whose $limit
    }
  }
  return $limits
}

# What a text proposes: lists of output, frequency and primitives.
proc proposals {text} {
  set proposals {}
  foreach line [split $text \n] {
    if {[regexp {^ +([0-9]+)  (\S+)(?: = \S+)?  +[-+]\S+ (?:ppm|%)  (.*)$} $line -> index \
        frequency labels]} {
      lappend proposals [list $index $frequency [lmap label [labels $labels] {lindex $label 0}] \
        [labels $labels]]
    }
  }
  return $proposals
}

# Primitives with their options, as lists, of a text with commas.
proc labels {text} {
  return [split [string map {{, } ,} $text] ,]
}

proc status {args} {
  return [dict get [::cli::vorkel {*}$args] status]
}

# The exit status of plan, where it is asked so often that a process for each would take long.
proc planned {args} {
  set call [::vorkel::options::request $args]
  return [::vorkel::answer::status [lindex [::vorkel::answer::rank [::vorkel::answer::all \
    [dict get $call request] [dict get $call primitives]]] 0]]
}

# The oscillators that a text names, with their primitives.
proc oscillators {text} {
  set found [dict create]
  if {![regexp {that make every frequency exact with the engine's search, MHz:\n(.*)} $text -> \
      text]} {
    return {}
  }
  foreach line [split $text \n] {
    if {[regexp {^([A-Z][-A-Za-z_0, ]+): ([0-9].*)$} $line -> labels list]} {
      foreach entry [split $list ,] {
        dict set found [string trim $entry] [lmap label [labels $labels] {lindex $label 0}]
      }
    }
  }
  return $found
}

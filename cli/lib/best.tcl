# The command best: the best of all settings of a PLL or a TSYN, beside what the engine answers.

package provide vorkel::best 1.1
package require vorkel::answer 1.1
package require vorkel::cells 1.1
package require vorkel::engine 1.1
package require vorkel::grid 1.1
package require vorkel::help 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::progress 1.1
package require vorkel::report 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::best {
  namespace path ::vorkel::cells
  # Options beside those of a request (see options.tcl).
  variable options {
    --front N "trade-offs to show, the best settings as the first; 6 by default"
  }
  variable most_front 1000
  # ppm. With a larger error there is nothing near what is asked for.
  variable far 1e5
  # What the answers are.
  variable best_variant "best of the grid"
  variable tradeoff_variant "trade-off"
}

# Writes the report on the best settings, what the engine has, and the trade-offs. The exit status
# is that of the best settings.
proc ::vorkel::best::run {words} {
  variable options
  variable tradeoff_variant
  set call [::vorkel::options::request $words $options]
  set request [dict get $call request]
  if {[dict get $call primitive] ne "auto"} {
    dict set request primitive [dict get $call primitive]
  }
  set primitives [Primitives $call]
  set most [Most [dict get $call given]]
  ::vorkel::output::into [dict get $call file]
  lassign [Search $request $primitives] points engine
  set front [::vorkel::grid::front $request $points]
  if {[llength $front] == 0} {
    Unsolved $call $primitives
  }
  set grid [BestOfEach $request $points [lindex $front 0]]
  set winner [lindex $grid 0]
  set format [dict get $call format]
  if {$format eq "sdc"} {
    # Constraints are those of one plan.
    set text [::vorkel::output::format $format [list $winner] $request]
  } else {
    # The first trade-off is the winner itself.
    set shown [lmap point [lrange $front 1 [expr {$most - 1}]] {
      ::vorkel::grid::answer $request $point $tradeoff_variant
    }]
    if {$format eq "text"} {
      set text [Text $grid $engine $shown [expr {[llength $front] - 1 - [llength $shown]}] $most \
        [Calmer $request $front $most]]
      append text [Hint $call $winner]
    } else {
      set text [::vorkel::output::format $format [concat $grid $shown $engine] $request]
    }
  }
  ::vorkel::output::write $text [dict get $call file]
  return [::vorkel::answer::status $winner]
}

# The primitives to search: those with a grid of M, D and dividers.
proc ::vorkel::best::Primitives {call} {
  set primitives [::vorkel::engine::ofFamily Loop [dict get $call primitives]]
  if {[llength $primitives] > 0} {
    return $primitives
  }
  if {[dict get $call primitive] ne "auto"} {
    throw {VORKEL USAGE} "--primitive: best searches the settings of PLL and TSYN, not of\
      [dict get $call primitive]; use plan or compare"
  }
  throw {VORKEL USAGE} "best searches the settings of PLL and TSYN, and\
    [dict get $call request device] has neither; use plan or compare"
}

# How many trade-offs to show, the best settings among them.
proc ::vorkel::best::Most {given} {
  variable most_front
  set text [::vorkel::options::get $given --front $::vorkel::grid::default_front]
  if {![regexp {^[0-9]{1,4}$} $text] || [scan $text %d] > $most_front} {
    throw {VORKEL USAGE} "--front: \"[::vorkel::options::shown $text]\" must be a\
      whole number from 0 to $most_front"
  }
  return [scan $text %d]
}

# The points of each primitive, a dict from primitive to list, the best first; and, if there are
# any, what the engine has for each, a list. A terminal sees how far this has come.
proc ::vorkel::best::Search {request primitives} {
  ::vorkel::progress::start [::vorkel::grid::stepsWithRuns $request $primitives $primitives] \
    "searching all settings"
  try {
    set points [::vorkel::grid::search $request $primitives ::vorkel::progress::step]
    if {[llength [concat {*}[dict values $points]]] == 0} {
      return [list $points {}]
    }
    set engine [lmap primitive $primitives {
      lindex [::vorkel::answer::rank [::vorkel::answer::all $request [list $primitive] \
        [list ::vorkel::progress::step $::vorkel::grid::run_steps]]] 0
    }]
    return [list $points $engine]
  } finally {
    ::vorkel::progress::finish
  }
}

# The best answer of each primitive that has one, the best of all first.
proc ::vorkel::best::BestOfEach {request points winner} {
  variable best_variant
  set firsts [lmap list [dict values $points] {
    if {[llength $list] == 0} continue
    lindex $list 0
  }]
  set others [lsearch -exact -all -inline -not $firsts $winner]
  return [lmap point [list $winner {*}$others] {
    ::vorkel::grid::answer $request $point $best_variant
  }]
}

proc ::vorkel::best::Unsolved {call primitives} {
  throw {VORKEL UNSOLVED} "no setting of [join $primitives { or }] of\
    [dict get $call request device] has everything in the device's ranges\nhint:\
    [::vorkel::help::command explain [dict get $call words]]"
}

# A sentence on the trade-off that has the least jitter within all tolerances, behind the best
# settings; "" when there is none. The trade-offs show the first `most`.
proc ::vorkel::best::Calmer {request front most} {
  set place [::vorkel::grid::calmest $request $front]
  if {$place < 1} {
    return ""
  }
  set answer [::vorkel::grid::answer $request [lindex $front $place]]
  set text " With less jitter, a [dict get $answer primitive] is also\
    within [Allowed $request]: [ppm $answer] ppm with [jitter $answer] ps"
  if {$place >= $most} {
    append text ", which --front [expr {$place + 1}] shows"
  }
  return $text.
}

# What a setting has to be within.
proc ::vorkel::best::Allowed {request} {
  if {[::vorkel::answer::isShapeAsked $request]} {
    return "all tolerances"
  }
  return "[::vorkel::numbers::short [dict get $request tolerance] 6] ppm"
}

# The report. `left` is how many trade-offs there are beside those that are shown, `calmer` a
# sentence on one of them.
proc ::vorkel::best::Text {grid engine shown left most calmer} {
  set winner [lindex $grid 0]
  set text [::vorkel::report::render $winner]
  append text "\n" [Beside [concat $grid $engine]]
  append text "\n" [::vorkel::table::prose "why: " [Why $winner [concat $grid $engine]]$calmer]
  if {$most > 0} {
    append text "\n" [Front $winner $shown $left $most]
  }
  foreach answer $engine {
    set sentences [expr {[dict get $answer solved] ? [dict get $answer violations] :
      [list [dict get $answer reason]]}]
    foreach sentence $sentences {
      append text [::vorkel::table::prose "[dict get $answer primitive], engine: " $sentence]
    }
  }
  return $text
}

# The table of the best settings and the engine's answers.
proc ::vorkel::best::Beside {answers} {
  set columns {{left source} {left primitive} {left loop} {right M} {right D} {right {VCO MHz}}
    {right {worst ppm}} {right {jitter ps}} {left mark}}
  set rows {}
  foreach answer $answers {
    set source [dict get $answer source]
    if {![dict get $answer solved]} {
      lappend rows [list $source [dict get $answer primitive] - - - - - - none]
      continue
    }
    lappend rows [list $source [dict get $answer primitive] [dict get $answer bandwidth] \
      {*}[Loop $answer] [vco $answer] [ppm $answer] \
      [jitter $answer] [mark $answer]]
  }
  return [render $columns $rows $answers]
}

# The trade-offs as text: the winner and those behind it.
proc ::vorkel::best::Front {winner shown left most} {
  if {[dict get $winner maxJitter] eq ""} {
    return "trade-offs: none, as the jitter is not known\n"
  }
  if {[llength $shown] + $left == 0} {
    return "trade-offs: none, no other setting has less jitter\n"
  }
  set text "trade-offs, less jitter for larger errors:\n[Tradeoffs [list $winner {*}$shown]]"
  if {$left > 0} {
    append text "and $left more with larger errors; --front [expr {$most + $left}] shows all\n"
  }
  return $text
}

# The table of trade-offs. The error tells as much as the mark, for which there is no room beside
# many dividers.
proc ::vorkel::best::Tradeoffs {answers} {
  set columns {{left primitive} {left loop} {right M} {right D} {right {worst ppm}}
    {right {jitter ps}} {left dividers} {left mark}}
  set rows {}
  foreach answer $answers {
    set dividers [lmap output [dict get $answer outputs] {
      ::vorkel::numbers::short [dict get $output divider] 3
    }]
    lappend rows [list [dict get $answer primitive] [dict get $answer bandwidth] \
      {*}[Loop $answer] [ppm $answer] [jitter $answer] \
      [join $dividers ,] [mark $answer]]
  }
  set plain [regsub -all {\033\[[0-9;]*m} [::vorkel::table::render $columns $rows] {}]
  set widths [lmap line [split $plain \n] {string length $line}]
  if {[tcl::mathfunc::max {*}$widths] > $::vorkel::table::line_width} {
    set columns [lrange $columns 0 end-1]
    set rows [lmap row $rows {lrange $row 0 end-1}]
  }
  return [render $columns $rows $answers]
}

proc ::vorkel::best::Loop {answer} {
  return [list [::vorkel::numbers::short [dict get $answer settings M] 3] \
    [dict get $answer settings D]]
}

# What makes the winner the best.
proc ::vorkel::best::Why {winner answers} {
  variable far
  set request [dict get $winner request]
  set asked [::vorkel::answer::isShapeAsked $request]
  set order "smallest worst frequency error first, then "
  if {$asked} {
    append order "smallest phase error, then duty cycle error, then "
  }
  append order [expr {[dict get $request preferMaxVco] ? "highest VCO, then least jitter" :
    "least jitter, then lowest VCO"}]
  set text "the best of all settings in the device's ranges by: $order"
  if {$asked} {
    append text [expr {[dict get $winner within] ?
      "; only settings with everything within its tolerance count, as there are such" :
      "; none has everything within its tolerance"}]
  }
  append text ". [Gain $winner $answers]"
  if {[dict get $winner worstPpm] > $far} {
    append text " No setting comes near what is asked for; explain tells why."
  }
  return $text
}

# What the search has gained over the engine's best answer.
proc ::vorkel::best::Gain {winner answers} {
  set engine [lmap answer [::vorkel::answer::rank $answers] {
    if {[dict get $answer source] ne "engine" || ![dict get $answer solved]} continue
    set answer
  }]
  if {[llength $engine] == 0} {
    return "The engine finds none."
  }
  set engine [lindex $engine 0]
  set text "The engine's best answer, of a [dict get $engine primitive],"
  set more [expr {[dict get $engine worstPpm] - [dict get $winner worstPpm]}]
  if {$more > 0.005} {
    return "$text is [ppm $engine] ppm off, this one [ppm $winner] ppm."
  }
  set near [expr {$more < -0.005 ? "is nearer in frequency, [ppm $engine] ppm off" :
    "has frequencies as near as that"}]
  if {[llength [dict get $engine violations]] > 0} {
    return "$text $near, but is outside of the device's range."
  }
  if {![dict get $engine within] && ([dict get $winner within] || $more < -0.005)} {
    return "$text $near, but is not within all tolerances."
  }
  return "$text $near."
}

proc ::vorkel::best::Hint {call winner} {
  if {[dict get $winner within]} {
    return ""
  }
  return "hint: what would work: [::vorkel::help::command explain [dict get $call words]]\n"
}

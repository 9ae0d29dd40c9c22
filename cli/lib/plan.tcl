# The commands plan and compare: what each primitive makes of a request, and which serves it best.

package provide vorkel::plan 1.1
package require vorkel::answer 1.1
package require vorkel::cells 1.1
package require vorkel::engine 1.1
package require vorkel::grid 1.1
package require vorkel::grid_words 1.1
package require vorkel::help 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::plan_refusals 1.1
package require vorkel::plan_why 1.1
package require vorkel::progress 1.1
package require vorkel::report 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::plan {
  namespace path ::vorkel::cells
  # The variants of the settings that the search over the whole grid has found: the nearest ones,
  # those that have less jitter and are still within all tolerances, and those that are the
  # engine's as well.
  variable grid_variant "grid, not engine"
  variable calm_variant "grid, calmer"
  variable common_variant "engine and grid"
}

# Writes the report on the engine's best answer and why it is the best; the exit status is its.
proc ::vorkel::plan::run {words} {
  set call [Read $words]
  set request [dict get $call request]
  set text [expr {[dict get $call format] eq "text"}]
  lassign [Search $call [expr {$text ? [Loops $call] : {}}]] ranked found
  set winner [lindex $ranked 0]
  if {![dict get $winner solved]} {
    Unsolved $call $ranked [expr {$text ? $found : [::vorkel::grid::search $request [Loops $call]]}]
  }
  if {!$text} {
    set text [::vorkel::output::format [dict get $call format] [list $winner] $request]
  } else {
    set text [::vorkel::report::render $winner]
    set best [BestOfEach $ranked]
    if {[llength $best] > 1} {
      append text \n [Contest $best]
    }
    append text \n [::vorkel::table::prose "why: " [::vorkel::plan_why::of $best $ranked]] \
      [::vorkel::plan_refusals::text $request $ranked] \
      [Hints $call $ranked [Better $call $winner $found]]
  }
  ::vorkel::output::write $text [dict get $call file]
  return [::vorkel::answer::status $winner]
}

# Writes the whole ranking, with the best that the whole grid of settings has. The exit status
# is that of the first row.
proc ::vorkel::plan::compare {words} {
  set call [Read $words]
  if {[dict get $call format] eq "sdc"} {
    throw {VORKEL USAGE} "compare has no --format sdc: constraints are those of one plan;\
      use plan, best or the command of a primitive"
  }
  set request [dict get $call request]
  lassign [Search $call [Loops $call]] engine found
  set ranked [::vorkel::answer::rank [Joined $engine [OfGrid $request $found]]]
  if {![dict get [lindex $ranked 0] solved]} {
    Unsolved $call $engine $found
  }
  if {[dict get $call format] ne "text"} {
    set text [::vorkel::output::format [dict get $call format] $ranked $request]
  } else {
    set text [Ranking $ranked]
    append text [::vorkel::plan_refusals::text $request $ranked] [Legend $ranked] \
      [GridHint $call $ranked $found] [Hints $call $ranked {}]
  }
  ::vorkel::output::write $text [dict get $call file]
  return [::vorkel::answer::status [lindex $ranked 0]]
}

proc ::vorkel::plan::Read {words} {
  set call [::vorkel::options::request $words]
  if {[dict get $call primitive] ne "auto"} {
    dict set call request primitive [dict get $call primitive]
  }
  ::vorkel::output::into [dict get $call file]
  return $call
}

# The primitives that have a grid of settings.
proc ::vorkel::plan::Loops {call} {
  return [::vorkel::engine::ofFamily Loop [dict get $call primitives]]
}

# Ends the command when no primitive has a configuration.
proc ::vorkel::plan::Unsolved {call answers found} {
  set request [dict get $call request]
  set words [dict get $call words]
  set text "no primitive of [dict get $request device] has a configuration for this\n"
  append text [::vorkel::plan_refusals::text $request $answers]
  set better [Better $call [lindex $answers 0] $found]
  append text "hint: [::vorkel::help::command explain $words]\n" [Beyond $better]
  throw {VORKEL UNSOLVED} [string trimright $text \n]
}

# The engine's answers, the best first, and the points of the whole grid of some primitives
# (see search of grid.tcl). A terminal sees how far this has come.
proc ::vorkel::plan::Search {call loops} {
  set request [dict get $call request]
  set primitives [dict get $call primitives]
  ::vorkel::progress::start [::vorkel::grid::stepsWithRuns $request $primitives $loops] \
    "asking the primitives"
  try {
    set engine [::vorkel::answer::rank [::vorkel::answer::all $request $primitives \
      [list ::vorkel::progress::step $::vorkel::grid::run_steps]]]
    return [list $engine [::vorkel::grid::search $request $loops ::vorkel::progress::step]]
  } finally {
    ::vorkel::progress::finish
  }
}

# What of the grid ranks before the engine's best answer: a list of a call that shows it, and the
# settings; nothing when there is none.
proc ::vorkel::plan::Better {call winner found} {
  set request [dict get $call request]
  set front [::vorkel::grid::front $request $found]
  set better [::vorkel::grid_words::better $request $front $winner]
  if {[llength $better] == 0} {
    return {}
  }
  return [list [::vorkel::grid_words::command $request $front [dict get $call words]] {*}$better]
}

# The best settings of the grid of each primitive; where these are within all tolerances and others
# that are so, too, have less jitter, those as well.
proc ::vorkel::plan::OfGrid {request found} {
  variable grid_variant
  variable calm_variant
  set answers {}
  dict for {primitive points} $found {
    set front [::vorkel::grid::tradeoffs $points]
    if {[llength $front] == 0} continue
    lappend answers [::vorkel::grid::answer $request [lindex $front 0] $grid_variant]
    set calmest [::vorkel::grid::calmest $request $front]
    if {$calmest > 0} {
      lappend answers [::vorkel::grid::answer $request [lindex $front $calmest] $calm_variant]
    }
  }
  return $answers
}

# The engine's answers and those of the grid; what is both is there once.
proc ::vorkel::plan::Joined {engine grid} {
  variable common_variant
  foreach answer $grid {
    set place 0
    foreach other $engine {
      if {[dict get $other solved] && [::vorkel::answer::isSame $answer $other]} break
      incr place
    }
    if {$place < [llength $engine]} {
      lset engine $place [dict replace [lindex $engine $place] variant $common_variant]
    } else {
      lappend engine $answer
    }
  }
  return $engine
}

# What the names of the variants that have to do with the grid mean.
proc ::vorkel::plan::Legend {ranked} {
  variable grid_variant
  variable calm_variant
  variable common_variant
  set meanings [list \
    $grid_variant "no answer of the engine, but the nearest settings of all that the primitive\
      has, as best finds them" \
    $calm_variant "likewise those with the least jitter of all that are within the tolerance" \
    $common_variant "the engine's answer, which is also that of the search over all settings"]
  set text ""
  set shown [lmap answer $ranked {dict get $answer variant}]
  foreach {variant meaning} $meanings {
    if {$variant in $shown} {
      append text [::vorkel::table::prose "$variant: " $meaning]
    }
  }
  if {$text eq ""} {
    return ""
  }
  return \n$text
}

# The first answer of each primitive.
proc ::vorkel::plan::BestOfEach {ranked} {
  set best [dict create]
  foreach answer $ranked {
    if {![dict exists $best [dict get $answer primitive]]} {
      dict set best [dict get $answer primitive] $answer
    }
  }
  return [dict values $best]
}

# The table of the best answer of each primitive.
proc ::vorkel::plan::Contest {best} {
  set least [dict get [lindex $best 0] maxJitter]
  set columns {{left primitive} {left variant} {left loop} {right {worst ppm}}
    {right {jitter ps}} {left result}}
  set rows {}
  foreach answer $best {
    if {![dict get $answer solved]} {
      lappend rows [list [dict get $answer primitive] - - - - "no configuration"]
      continue
    }
    set jitter [dict get $answer maxJitter]
    if {[llength $rows] == 0} {
      set result winner
    } elseif {![dict get $answer within]} {
      set result OFF
    } elseif {$jitter eq "" || $least eq ""} {
      set result ""
    } else {
      set result [expr {[jitter $answer] eq [jitter [lindex $best 0]] ? "the same jitter" :
        "[::vorkel::numbers::ps [expr {$jitter - $least}]] ps more"}]
    }
    if {[llength $rows] == 0 && ![dict get $answer within]} {
      set result "winner, but OFF"
    }
    lappend rows [list [dict get $answer primitive] [dash [dict get $answer variant]] \
      [dash [dict get $answer bandwidth]] [ppm $answer] [jitter $answer] $result]
  }
  return [render $columns $rows $best]
}

# The table of all answers that are solved.
proc ::vorkel::plan::Ranking {ranked} {
  set columns {{right #} {left primitive} {left variant} {left loop} {right {VCO MHz}}
    {right {worst ppm}} {right {jitter ps}} {left off}}
  set rows {}
  set shown {}
  foreach answer $ranked {
    if {![dict get $answer solved]} continue
    lappend shown $answer
    lappend rows [list [llength $shown] [dict get $answer primitive] \
      [dash [dict get $answer variant]] [dash [dict get $answer bandwidth]] [vco $answer] \
      [ppm $answer] [jitter $answer] [mark $answer]]
  }
  return [render $columns $rows $shown][Order $shown]
}

# What is told of the order when something is out of the device's range.
proc ::vorkel::plan::Order {shown} {
  foreach answer $shown {
    if {[llength [dict get $answer violations]] > 0} {
      return \n[::vorkel::table::prose "" "Rows with something out of the device's range come after\
        all others."]
    }
  }
  return ""
}

# What the user may want to do next. `better` is what Better has.
proc ::vorkel::plan::Hints {call ranked better} {
  set words [dict get $call words]
  set first [lindex $ranked 0]
  set refused [::vorkel::plan_refusals::names $ranked]
  set text ""
  if {![dict get $first within]} {
    append text "hint: what stands in the way: [::vorkel::help::command explain $words]\n"
    # Only PLL and TSYN have a grid of settings.
    if {[llength $better] == 0 && [llength [Loops $call]] > 0 &&
        [dict get $first source] ne "grid"} {
      append text "hint: the best settings of all: [::vorkel::help::command best $words]\n"
    }
  } elseif {[llength $refused] > 0} {
    append text "hint: more on [::vorkel::options::enumerate $refused]:\
      [::vorkel::help::command explain $words]\n"
  }
  append text [Beyond $better]
  if {[dict get $first solved] && [dict get $first bandwidth] ne "" &&
      [dict get $call request inputJitter] == 0 && [dict get $first maxJitter] ne ""} {
    append text [::vorkel::table::prose "hint: " "this is for an input clock without jitter;\
      --input-jitter PS tells that of yours, which can make another bandwidth the best"]
  }
  return $text
}

# The call that shows the settings of the grid whole when these rank first.
proc ::vorkel::plan::GridHint {call ranked found} {
  if {[dict get [lindex $ranked 0] source] ne "grid"} {
    return ""
  }
  set request [dict get $call request]
  return "hint: the settings of the grid: [::vorkel::grid_words::command $request \
    [::vorkel::grid::front $request $found] [dict get $call words]]\n"
}

# What Better has, in words.
proc ::vorkel::plan::Beyond {better} {
  if {[llength $better] == 0} {
    return ""
  }
  set settings [lassign $better command]
  set parts [lmap answer $settings {
    string cat "a [dict get $answer primitive] within [::vorkel::grid_words::figures $answer]"
  }]
  return "[::vorkel::table::prose "hint: " "settings that the engine's search does not find rank\
    before this: [join $parts {, and }]"]hint: these settings: $command\n"
}

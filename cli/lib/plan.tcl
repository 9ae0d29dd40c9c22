# The commands plan and compare: what each primitive makes of a request, and which serves it best.

package provide vorkel::plan 1.1
package require vorkel::answer 1.1
package require vorkel::cells 1.1
package require vorkel::engine 1.1
package require vorkel::help 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::progress 1.1
package require vorkel::report 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::plan {
  namespace path ::vorkel::cells
  # The variant of the settings that the search over the whole grid has found.
  variable grid_variant "grid, not engine"
}

# Writes the report on the best answer and why it is the best; the exit status is its.
proc ::vorkel::plan::run {words} {
  set call [Read $words]
  set request [dict get $call request]
  set ranked [lindex [Search $call] 0]
  set winner [lindex $ranked 0]
  if {![dict get $winner solved]} {
    Unsolved $call $ranked
  }
  if {[dict get $call format] ne "text"} {
    set text [::vorkel::output::format [dict get $call format] [list $winner] $request]
  } else {
    set text [::vorkel::report::render $winner]
    set best [BestOfEach $ranked]
    if {[llength $best] > 1} {
      append text \n [Contest $best]
    }
    append text \n [::vorkel::table::prose "why: " [Why $best $ranked]] \
      [Refusals $ranked] [Hints $call $winner]
  }
  ::vorkel::output::write $text [dict get $call file]
  return [::vorkel::answer::status $winner]
}

# Writes the whole ranking, with the best that the whole grid of settings has. The exit status
# is that of the engine's best answer.
proc ::vorkel::plan::compare {words} {
  set call [Read $words]
  if {[dict get $call format] eq "sdc"} {
    throw {VORKEL USAGE} "compare has no --format sdc: constraints are those of one plan;\
      use plan, best or the command of a primitive"
  }
  set request [dict get $call request]
  package require vorkel::grid 1.1
  lassign [Search $call [::vorkel::engine::ofFamily Loop [dict get $call primitives]]] engine grid
  set ranked [::vorkel::answer::rank [concat $engine $grid]]
  # Settings that are off do not make up for the lack of an answer.
  if {![dict get [lindex $engine 0] solved] && ![dict get [lindex $ranked 0] within]} {
    Unsolved $call $engine
  }
  if {[dict get $call format] ne "text"} {
    set text [::vorkel::output::format [dict get $call format] $ranked $request]
  } else {
    set text [Ranking $ranked]
    append text [Refusals $ranked]
    if {[llength $grid] > 0} {
      append text "\n" [::vorkel::table::prose "" "A row \"$::vorkel::plan::grid_variant\" is\
        not an answer of the engine: it is the best of all settings that the device allows.\
        best shows it whole."]
    }
    append text [Hints $call [lindex $engine 0]]
  }
  ::vorkel::output::write $text [dict get $call file]
  return [::vorkel::answer::status [lindex $engine 0]]
}

proc ::vorkel::plan::Read {words} {
  set call [::vorkel::options::request $words]
  ::vorkel::output::into [dict get $call file]
  return $call
}

# Ends the command when no primitive has a configuration.
proc ::vorkel::plan::Unsolved {call answers} {
  set request [dict get $call request]
  set text "no primitive of [dict get $request device] has a configuration for this"
  foreach answer $answers {
    append text \n [string trimright [::vorkel::table::prose "[dict get $answer primitive]: " \
      [dict get $answer reason]] \n]
  }
  append text "\nhint: [::vorkel::help::command explain [dict get $call words]]"
  throw {VORKEL UNSOLVED} $text
}

# The engine's answers, the best first, and the best settings of the whole grid of some primitives,
# which is searched only for `loops`. A terminal sees how far this has come.
proc ::vorkel::plan::Search {call {loops {}}} {
  variable grid_variant
  set request [dict get $call request]
  set primitives [dict get $call primitives]
  set run_steps [expr {[llength $loops] > 0 ? $::vorkel::grid::run_steps : 1}]
  set steps [expr {[::vorkel::answer::runs $request $primitives] * $run_steps}]
  foreach primitive $loops {
    incr steps [::vorkel::grid::steps $request $primitive]
  }
  ::vorkel::progress::start $steps "asking the primitives"
  try {
    set engine [::vorkel::answer::rank [::vorkel::answer::all $request $primitives \
      [list ::vorkel::progress::step $run_steps]]]
    set grid [concat {*}[lmap primitive $loops {
      ::vorkel::grid::best $request $primitive $grid_variant ::vorkel::progress::step
    }]]
    return [list $engine $grid]
  } finally {
    ::vorkel::progress::finish
  }
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
      set result "[::vorkel::numbers::ps [expr {$jitter - $least}]] ps more"
    }
    if {[llength $rows] == 0 && ![dict get $answer within]} {
      set result "winner, but OFF"
    }
    lappend rows [list [dict get $answer primitive] [dash [dict get $answer variant]] \
      [dash [dict get $answer bandwidth]] [ppm $answer] [jitter $answer] $result]
  }
  return [::vorkel::table::render $columns $rows [roles $best]]
}

# The table of all answers that are solved.
proc ::vorkel::plan::Ranking {ranked} {
  set columns {{right #} {left primitive} {left variant} {left loop} {right {VCO MHz}}
    {right {worst ppm}} {right {jitter ps}} {left mark}}
  set rows {}
  set shown {}
  foreach answer $ranked {
    if {![dict get $answer solved]} continue
    lappend shown $answer
    lappend rows [list [llength $shown] [dict get $answer primitive] \
      [dash [dict get $answer variant]] [dash [dict get $answer bandwidth]] [vco $answer] \
      [ppm $answer] [jitter $answer] [mark $answer]]
  }
  return [::vorkel::table::render $columns $rows [roles $shown]]
}

# Why the first of the best answers of each primitive is before the others.
proc ::vorkel::plan::Why {best ranked} {
  set winner [lindex $best 0]
  set name [dict get $winner primitive]
  set tolerance [::vorkel::numbers::short [dict get $winner request tolerance] 6]
  set limit [expr {$tolerance == 0 ? "exact" : "within $tolerance ppm"}]
  if {![dict get $winner within]} {
    return [WhyNothing $winner]
  }
  set within [Within $best]
  if {[llength $best] == 1} {
    set text "all outputs of the $name are $limit"
  } elseif {[llength $within] == 1} {
    set text "$name is the only primitive whose outputs are all $limit"
  } else {
    set text "of [Names $within], whose outputs are all $limit, $name\
      [Advantage $winner [lindex $within 1] "the [dict get [lindex $within 1] primitive]"]"
  }
  set variants [Within [::vorkel::answer::ofPrimitive $ranked $name]]
  if {[llength $variants] > 1} {
    append text ". Of its [llength $variants] settings, [Described $winner]\
      [Advantage $winner [lindex $variants 1] "the next"]"
  }
  return $text.
}

# The same when not even it is as asked for.
proc ::vorkel::plan::WhyNothing {winner} {
  set text "nothing is as asked for"
  if {[llength [dict get $winner violations]] > 0} {
    append text " and in the device's range"
  } else {
    set offs [lsort -unique [concat {*}[lmap output [dict get $winner outputs] {
      dict get $output offs
    }]]]
    set what [expr {"ppm" in $offs ? "frequencies" :
      "phaseError" in $offs ? "phases" : "duty cycles"}]
    append text "; of what there is, the [dict get $winner primitive] has the $what that are\
      nearest"
  }
  return $text.
}

# Those answers that are within their tolerance.
proc ::vorkel::plan::Within {answers} {
  return [lmap answer $answers {
    if {![dict get $answer within]} continue
    set answer
  }]
}

proc ::vorkel::plan::Names {answers} {
  return [::vorkel::options::enumerate [lmap answer $answers {dict get $answer primitive}]]
}

# The variant and the bandwidth of an answer, in words.
proc ::vorkel::plan::Described {answer} {
  set parts [list [dict get $answer variant]]
  if {[dict get $answer bandwidth] ne ""} {
    lappend parts "bandwidth [dict get $answer bandwidth]"
  }
  return [join $parts { with }]
}

# What an answer has before another one, both within their tolerance.
proc ::vorkel::plan::Advantage {winner other whose} {
  set jitter [dict get $winner maxJitter]
  set more [dict get $other maxJitter]
  if {$jitter ne "" && $more ne "" && $jitter < $more} {
    return "has the least jitter, [::vorkel::numbers::ps $jitter] ps; $whose has\
      [::vorkel::numbers::ps $more] ps"
  }
  if {$jitter ne "" && $more eq ""} {
    return "has a jitter that is known, [::vorkel::numbers::ps $jitter] ps"
  }
  set same [expr {$jitter eq "" ? "without a known jitter" : "with the same jitter"}]
  if {[dict exists $winner settings VCO] && [dict exists $other settings VCO] &&
      [dict get $winner settings VCO] < [dict get $other settings VCO]} {
    return "$same has the lowest VCO, [vco $winner] MHz"
  }
  return "$same comes first"
}

# A line for each primitive without a configuration.
proc ::vorkel::plan::Refusals {ranked} {
  set text ""
  foreach answer $ranked {
    if {![dict get $answer solved]} {
      append text [::vorkel::table::prose "[dict get $answer primitive]: " \
        [dict get $answer reason]]
    }
  }
  return $text
}

# What the user may want to do next.
proc ::vorkel::plan::Hints {call winner} {
  set words [dict get $call words]
  set text ""
  if {![dict get $winner solved] || ![dict get $winner within]} {
    append text "hint: what stands in the way: [::vorkel::help::command explain $words]\n"
    # Only PLL and TSYN have a grid of settings.
    if {[llength [::vorkel::engine::ofFamily Loop [dict get $call primitives]]] > 0} {
      append text "hint: the best settings of all: [::vorkel::help::command best $words]\n"
    }
  }
  if {[dict get $winner solved] && [dict get $winner bandwidth] ne "" &&
      [dict get $call request inputJitter] == 0 && [dict get $winner maxJitter] ne ""} {
    append text [::vorkel::table::prose "hint: " "this is for an input clock without jitter;\
      --input-jitter PS tells that of yours, which can make another bandwidth the best"]
  }
  return $text
}

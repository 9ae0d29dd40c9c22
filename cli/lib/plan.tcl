# The commands plan and compare: what each primitive makes of a request, and which serves it best.

package provide vorkel::plan 1.1
package require vorkel::answer 1.1
package require vorkel::help 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::report 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::plan {
  # The variant of the settings that the search over the whole grid has found.
  variable grid_variant "grid, not engine"
}

# Writes the report on the best answer and why it is the best; the exit status is its.
proc ::vorkel::plan::run {words} {
  set call [Read $words]
  set request [dict get $call request]
  set ranked [::vorkel::answer::rank \
    [::vorkel::answer::all $request [dict get $call primitives]]]
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
  set engine [::vorkel::answer::rank \
    [::vorkel::answer::all $request [dict get $call primitives]]]
  set ranked [::vorkel::answer::rank [concat $engine [Grid $call]]]
  # Settings that are off do not make up for the lack of an answer.
  if {![dict get [lindex $engine 0] solved] && ![dict get [lindex $ranked 0] within]} {
    Unsolved $call $engine
  }
  if {[dict get $call format] ne "text"} {
    set text [::vorkel::output::format [dict get $call format] $ranked $request]
  } else {
    set text [Ranking $ranked]
    append text [Refusals $ranked]
    if {[lsearch -exact [lmap answer $ranked {dict get $answer source}] grid] >= 0} {
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
  if {[dict get $call file] ne ""} {
    ::vorkel::colour::off
  }
  return $call
}

# Ends the command when no primitive has a configuration.
proc ::vorkel::plan::Unsolved {call answers} {
  set request [dict get $call request]
  set text "no primitive of [dict get $request device] has a configuration for this"
  foreach answer $answers {
    append text "\n[dict get $answer primitive]: [dict get $answer reason]"
  }
  append text "\nhint: [::vorkel::help::command explain [dict get $call words]]"
  throw {VORKEL UNSOLVED} $text
}

# The best settings of the whole grid, a list of answers, for the primitives that have one.
proc ::vorkel::plan::Grid {call} {
  variable grid_variant
  set answers {}
  if {[llength [package versions vorkel::grid]] == 0} {
    return {}
  }
  package require vorkel::grid 1.1
  foreach primitive [dict get $call primitives] {
    if {[::vorkel::engine::family $primitive] ne "Loop"} continue
    foreach answer [::vorkel::grid::best [dict get $call request] $primitive] {
      dict set answer variant $grid_variant
      lappend answers $answer
    }
  }
  return $answers
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
      set result "[::vorkel::numbers::fixed [expr {$jitter - $least}] 3] ps more"
    }
    if {[llength $rows] == 0 && ![dict get $answer within]} {
      set result "winner, but OFF"
    }
    lappend rows [list [dict get $answer primitive] [Dash [dict get $answer variant]] \
      [Dash [dict get $answer bandwidth]] [Ppm $answer] [Dash $jitter] $result]
  }
  return [::vorkel::table::render $columns $rows [Roles $best]]
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
    set vco -
    if {[dict exists $answer settings VCO]} {
      set vco [format %.6g [dict get $answer settings VCO]]
    }
    lappend rows [list [llength $shown] [dict get $answer primitive] \
      [Dash [dict get $answer variant]] [Dash [dict get $answer bandwidth]] $vco [Ppm $answer] \
      [Dash [dict get $answer maxJitter]] [expr {[dict get $answer within] ? "" : "OFF"}]]
  }
  return [::vorkel::table::render $columns $rows [Roles $shown]]
}

proc ::vorkel::plan::Roles {answers} {
  set roles {}
  foreach answer $answers {
    if {[dict get $answer within]} {
      lappend roles [expr {[llength $roles] == 0 ? "good" : ""}]
    } else {
      lappend roles off
    }
  }
  return $roles
}

proc ::vorkel::plan::Dash {text} {
  if {$text eq ""} {
    return -
  }
  return $text
}

# The worst error of an answer, in at most nine characters.
proc ::vorkel::plan::Ppm {answer} {
  set ppm [dict get $answer worstPpm]
  if {$ppm >= 1e6} {
    return [format %.3g $ppm]
  }
  return [::vorkel::numbers::fixed $ppm 2]
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
  set variants [Within [lmap answer $ranked {
    if {[dict get $answer primitive] ne $name} continue
    set answer
  }]]
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
  set names [lmap answer $answers {dict get $answer primitive}]
  return "[join [lrange $names 0 end-1] {, }] and [lindex $names end]"
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
    return "has the least jitter, $jitter ps; $whose has $more ps"
  }
  if {$jitter ne "" && $more eq ""} {
    return "has a jitter that is known, $jitter ps"
  }
  set same [expr {$jitter eq "" ? "without a known jitter" : "with the same jitter"}]
  if {[dict exists $winner settings VCO] && [dict exists $other settings VCO] &&
      [dict get $winner settings VCO] < [dict get $other settings VCO]} {
    return "$same has the lowest VCO, [format %.6g [dict get $winner settings VCO]] MHz"
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
    if {"Loop" in [lmap primitive [dict get $call primitives] {
      ::vorkel::engine::family $primitive
    }]} {
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

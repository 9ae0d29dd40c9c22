# The command explain: which limits stand in the way of a request, and what would work.
#
# The kinds of limits are
#   number of clocks      the primitive has not so many inputs or outputs
#   PFD range, VCO range  of the input clocks, or the VCO for one output
#   inputs too far apart  one M and D cannot serve both
#   output range, divider range, M and D
#                         of an output of a PLL or a TSYN
#   phase grid, duty grid, high and low count
#                         of an output that is possible without its phase or duty cycle
#   pin frequency, pin range, pin phase
#                         of a KRU
#   outputs together      each is possible, but not with the others
#   M in eighths          the hardware has them, but they do not help
#   the engine            the hardware could, but the engine does not answer so

package provide vorkel::explain 1.1
package require vorkel::answer 1.1
package require vorkel::colour 1.1
package require vorkel::engine 1.1
package require vorkel::explain_advice 1.1
package require vorkel::explain_grid 1.1
package require vorkel::explain_inputs 1.1
package require vorkel::explain_kru 1.1
package require vorkel::explain_loop 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_swap 1.1
package require vorkel::explain_text 1.1
package require vorkel::help 1.1
package require vorkel::notes 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::output 1.1
package require vorkel::progress 1.1
package require vorkel::table 1.1
package require vorkel::units 1.1

namespace eval ::vorkel::explain {
  namespace path ::vorkel::explain_text
  # The options that only this command has.
  variable options {
    --oscillators LIST "input frequencies to try instead of stock oscillators"
  }
}

# Writes the explanation. That is what was asked for, so the exit status is 0.
proc ::vorkel::explain::run {words} {
  variable options
  ::vorkel::explain_nearest::start
  set call [::vorkel::options::request $words $options]
  ::vorkel::output::into [dict get $call file]
  set texts [Oscillators $call]
  # What is to be searched at most: both sides of each output on each primitive, and the inputs.
  ::vorkel::progress::start [expr {2 * [llength [dict get $call request outputs]] *
    [llength [dict get $call primitives]] + [llength $texts]}] "searching"
  try {
    set text [Explanation $call $texts]
  } finally {
    ::vorkel::progress::finish
  }
  ::vorkel::output::write $text [dict get $call file]
  return 0
}

# All that is told.
proc ::vorkel::explain::Explanation {call texts} {
  set answers [::vorkel::answer::rank [::vorkel::answer::all [dict get $call request] \
    [dict get $call primitives]]]
  set found [::vorkel::explain_grid::look [dict get $call request] [dict get $call primitives] \
    $answers]
  set findings [Findings $call $answers $found]
  set text [Head $call]\n
  append text [Verdict $call $findings $answers $found] [Reasons $findings] \
    [::vorkel::explain_swap::advice $call $answers] \
    [::vorkel::explain_advice::nearest $call $findings $answers $found] \
    [expr {[::vorkel::explain_inputs::isCountOnly $findings] ? "" :
      [::vorkel::explain_advice::inputs $call $texts [dict get [lindex $answers 0] within]]}] \
    [Hints $call $answers $found]
  return $text
}

# The oscillators to try, as texts.
proc ::vorkel::explain::Oscillators {call} {
  set given [dict get $call given]
  if {![dict exists $given --oscillators]} {
    return $::vorkel::explain_nearest::stock
  }
  set list [dict get $given --oscillators]
  ::vorkel::units::values $list frequency --oscillators
  return [lmap entry [split $list ,] {string trim $entry}]
}

# For each primitive that does not do what is asked, its findings: a dict. `found` is what
# explain_grid.tcl has found.
proc ::vorkel::explain::Findings {call answers {found {}}} {
  set request [dict get $call request]
  set findings [dict create]
  foreach primitive [dict get $call primitives] {
    set best [lindex [::vorkel::answer::ofPrimitive $answers $primitive] 0]
    if {[dict get $best within]} continue
    dict set findings $primitive [Why $request $primitive $best $found]
  }
  return $findings
}

# The findings for one primitive, whose best answer it is.
proc ::vorkel::explain::Why {request primitive answer found} {
  set refusal [::vorkel::answer::refusal $request $primitive]
  if {$refusal ne ""} {
    return [list [finding "number of clocks" {} \
      [string tolower [string trimright $refusal .] 0 0]]]
  }
  if {[::vorkel::engine::family $primitive] eq "Kru"} {
    set findings [::vorkel::explain_kru::findings $request $primitive]
    set moved [Duties $request]
    if {[llength $moved] > 0} {
      lappend findings [finding "duty grid" $moved "a KRU has no setting for the duty cycle"]
    }
  } else {
    set findings [::vorkel::explain_grid::completed $request $primitive \
      [::vorkel::explain_loop::findings $request $primitive] $found]
  }
  if {[llength $findings] > 0} {
    return $findings
  }
  return [list [Engine $answer]]
}

# The outputs with a duty cycle that is not that of every clock.
proc ::vorkel::explain::Duties {request} {
  return [lmap index [::vorkel::answer::indices $request] {
    if {[dict get [lindex [dict get $request outputs] $index] duty] in {"" 50 50.0}} continue
    set index
  }]
}

# No limit stands in the way, but the engine answers something else.
proc ::vorkel::explain::Engine {answer} {
  set text "no limit of the device stands in the way, but the engine "
  if {[dict get $answer solved]} {
    append text "takes settings that are off: it looks for the first that are near enough for it"
  } else {
    append text "finds none: it looks for a VCO from output 0 on and in steps of its own"
  }
  return [finding "the engine" [Offs $answer] "$text. best searches all settings"]
}

# The outputs of an answer that are off.
proc ::vorkel::explain::Offs {answer} {
  if {![dict get $answer solved]} {
    return {}
  }
  return [lmap output [dict get $answer outputs] {
    if {[dict get $output within]} continue
    dict get $output index
  }]
}

# What was asked.
proc ::vorkel::explain::Head {call} {
  set request [dict get $call request]
  set outputs [lmap output [dict get $request outputs] {Asked $output}]
  set tolerance [::vorkel::numbers::short [dict get $request tolerance] 6]
  return [string cat [::vorkel::table::pairs [list \
    device [dict get $request device] \
    input "[join [lmap input [dict get $request inputs] {
      number $input
    }] {, }] MHz" \
    tolerance [expr {$tolerance == 0 ? "exact" : "$tolerance ppm"}]]] \
    [List "outputs    " $outputs]]
}

# Words behind a label, with commas, in as many lines as it takes, below each other.
proc ::vorkel::explain::List {label words} {
  set lines {}
  set line ""
  foreach word [lrange $words 0 end-1] {
    lappend parts $word,
  }
  lappend parts [lindex $words end]
  foreach part $parts {
    if {$line ne "" &&
        [string length "$label$line $part"] > $::vorkel::table::line_width} {
      lappend lines $line
      set line ""
    }
    append line [expr {$line eq "" ? "" : " "}] $part
  }
  return "$label[join [list {*}$lines $line] \n[string repeat { } [string length $label]]]\n"
}

proc ::vorkel::explain::Asked {output} {
  set text "[number [dict get $output freq]] MHz"
  if {[dict get $output phase] ne ""} {
    append text " at [number [dict get $output phase]] degrees"
  }
  if {[dict get $output duty] ne ""} {
    append text " with [number [dict get $output duty]] % high"
  }
  return $text
}

# Whether it is possible, and else how near the best answer is.
proc ::vorkel::explain::Verdict {call findings answers found} {
  set able [lmap primitive [dict get $call primitives] {
    if {[dict exists $findings $primitive]} continue
    set primitive
  }]
  if {[llength $able] > 0} {
    set verb [expr {[llength $able] > 1 ? "make" : "makes"}]
    return [::vorkel::colour::paint good [::vorkel::table::prose "" "Possible:\
      [::vorkel::options::enumerate $able] $verb all of it."]]
  }
  set settings [::vorkel::explain_grid::winner [dict get $call request] $found]
  if {$settings ne "" && [dict get $settings within]} {
    return [::vorkel::colour::paint good [::vorkel::table::prose "" \
      [::vorkel::explain_grid::possible $settings]]]
  }
  set best [lindex $answers 0]
  set whom [expr {[llength [dict get $call primitives]] == 1 ?
    "the [lindex [dict get $call primitives] 0]" : "every primitive"}]
  set how [expr {[IsOnlyEngine $findings] ? " with the engine's search" : ""}]
  set text "Not possible$how: something stands in the way of $whom."
  if {[dict get $best solved]} {
    append text " The engine's nearest answer is that of the [dict get $best primitive]:\
      [join [list {*}[Worst $best] {*}[dict get $best violations]] {; }]."
  }
  append text [::vorkel::explain_grid::nearer $settings $best]
  return [::vorkel::colour::paint off [::vorkel::table::prose "" $text]]
}

# A list of what of an answer is furthest off, and how many outputs are so beside it.
proc ::vorkel::explain::Worst {answer} {
  foreach key {ppm phaseError dutyError} {
    set worst ""
    foreach output [dict get $answer outputs] {
      if {$key in [dict get $output offs] && ($worst eq "" ||
          abs([dict get $output $key]) > abs([dict get $worst $key]))} {
        set worst $output
      }
    }
    if {$worst ne ""} break
  }
  if {$worst eq ""} {
    return {}
  }
  set text [lindex [::vorkel::notes::errors [dict replace $answer outputs [list $worst]]] 0]
  set count [expr {[llength [::vorkel::notes::errors $answer]] - 1}]
  if {$count > 0} {
    append text "; the tolerances of $count other output[expr {$count > 1 ? "s are" : " is"}]\
      exceeded, too"
  }
  return [list $text]
}

# Whether some primitive could do all that is asked, but for the engine.
proc ::vorkel::explain::IsOnlyEngine {findings} {
  foreach found [dict values $findings] {
    if {[lsort -unique [lmap finding $found {dict get $finding kind}]] eq {{the engine}}} {
      return 1
    }
  }
  return 0
}

# A paragraph for each finding.
proc ::vorkel::explain::Reasons {findings} {
  set text ""
  dict for {primitive found} $findings {
    append text \n
    foreach finding $found {
      set whom $primitive
      set outputs [dict get $finding outputs]
      if {[llength $outputs] > 0} {
        append whom ", [outputs $outputs]"
      }
      append text [::vorkel::table::prose "$whom: " "[dict get $finding kind]: [dict get $finding \
        text]."]
    }
  }
  return $text
}

proc ::vorkel::explain::Hints {call answers found} {
  set settings [::vorkel::explain_grid::winner [dict get $call request] $found]
  set text ""
  if {$::vorkel::explain_nearest::stopped} {
    append text \n [::vorkel::table::prose "note: " "the search for what works was cut short; there\
      may be more and nearer"]
  }
  if {[dict get [lindex $answers 0] within]} {
    append text "\nhint: the settings: [::vorkel::help::command plan [dict get $call words]]\n"
  } elseif {$settings ne ""} {
    set which [expr {[dict get $settings within] ? "the settings" :
      "the nearest settings of all"}]
    append text "\nhint: $which: [::vorkel::help::command best [dict get $call words]]\n"
  }
  return $text
}

# What explain tells of the requests nearby that would work, as paragraphs and a table.

package provide vorkel::explain_advice 1.1
package require vorkel::answer 1.1
package require vorkel::engine 1.1
package require vorkel::explain_calls 1.1
package require vorkel::explain_grid 1.1
package require vorkel::explain_inputs 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_steps 1.1
package require vorkel::explain_text 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::grid 1.1
package require vorkel::help 1.1
package require vorkel::options 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::explain_advice {
  namespace path ::vorkel::explain_text
  # As many outputs are told what would work for them.
  variable most_outputs 3
}

# The nearest requests for the outputs that something stands in the way of. `found` is what
# explain_grid.tcl has found.
proc ::vorkel::explain_advice::nearest {call findings answers found} {
  variable most_outputs
  set request [dict get $call request]
  set primitives [dict get $call primitives]
  if {[dict get [lindex $answers 0] within]} {
    return ""
  }
  if {[::vorkel::explain_inputs::areInTheWay $findings]} {
    return [::vorkel::explain_inputs::advice $request $findings]
  }
  set offenders [Offenders $findings]
  if {[llength $offenders] == 0} {
    set offenders [::vorkel::answer::indices $request]
  }
  set rows {}
  set moved {}
  set tried {}
  set helped 0
  foreach index $offenders {
    if {$helped >= $most_outputs} break
    lappend tried $index
    set own [Rows $request $primitives $index]
    set steps [Steps $request $primitives $index]
    lappend rows {*}$own
    lappend moved {*}$steps {*}[Unmoved $request $primitives $index]
    incr helped [expr {[llength $own] + [llength $steps] > 0}]
  }
  set left [lrange $offenders [llength $tried] end]
  set text [Unfed $call]
  if {[llength $rows] > 0} {
    append text \n [Table $rows $primitives] [First $call {*}[lrange [lindex $rows 0] 0 1]]
  }
  if {$helped == 0} {
    append text [Together $call [::vorkel::explain_nearest::sets $request $primitives] \
      [::vorkel::explain_nearest::gridSet $request [::vorkel::explain_grid::winner $request \
        $found]] $tried]
  }
  if {[llength $moved] > 0} {
    append text \n
    foreach sentence $moved {
      append text [::vorkel::table::prose "" $sentence]
    }
  }
  dict for {index texts} $::vorkel::explain_nearest::passed {
    append text \n [::vorkel::table::prose "note: " "output $index: [join $texts {, }] would be\
      nearer; the engine does not find the settings, best does"]
  }
  if {[llength $left] > 0} {
    append text \n [::vorkel::table::prose "note: " "what would work instead of\
      [outputs $left] has not been searched"]
  }
  return $text
}

# That the pins of a KRU_SP without feedback make all of it, when feedback was asked for; else "".
proc ::vorkel::explain_advice::Unfed {call} {
  set request [dict replace [dict get $call request] feedback 0]
  if {![dict get $call request feedback] || "KRU_SP" ni [dict get $call primitives] ||
      [::vorkel::explain_nearest::proof $request KRU_SP] eq ""} {
    return ""
  }
  set index [::vorkel::explain_calls::index [dict get $call words] --feedback]
  # Feedback that a request file asks for is taken out there.
  if {$index < 0} {
    return \n[::vorkel::table::prose "" "without feedback the KRU_SP makes all of it"]
  }
  set words [lreplace [dict get $call words] $index $index]
  return "\n[::vorkel::table::prose {} {without --feedback the KRU_SP makes all of it}]hint:\
    without it: [::vorkel::help::command plan $words]\n"
}

# The frequencies that work for an output, as rows of a table.
proc ::vorkel::explain_advice::Rows {request primitives index} {
  return [lmap near [::vorkel::explain_nearest::frequencies $request $primitives $index] {
    list $index [Spelled $near] [far [dict get $near ppm]] \
      [join [dict get $near labels] {, }]
  }]
}

# A call with the frequency of a row.
proc ::vorkel::explain_advice::First {call index spelled} {
  set outputs [dict get $call request outputs]
  set texts [lmap output $outputs {plainMHz [dict get $output freq]}]
  lset texts $index [lindex [split $spelled] 0]
  return "hint: the first of these: [::vorkel::explain_calls::command plan $call $outputs $texts]\n"
}

proc ::vorkel::explain_advice::Table {rows primitives} {
  set which [expr {[llength $primitives] == 1 ? "the nearest two below and above" :
    "the nearest below and above of each primitive"}]
  set columns {{right output} {left {MHz instead}} {right change} {left {made by}}}
  set head [::vorkel::table::prose "" "frequencies nearby that the engine's search makes, all else\
    as asked for; $which:"]
  set table [::vorkel::table::render $columns $rows]
  foreach line [split $table \n] {
    if {[string length $line] > $::vorkel::table::line_width} {
      # A quotient with many digits stands for itself.
      set rows [lmap row $rows {lreplace $row 1 1 [lindex [split [lindex $row 1] =] 0]}]
      return $head[::vorkel::table::render $columns $rows]
    }
  }
  return $head$table
}

# Sentences on the phases and duty cycles that work for an output.
proc ::vorkel::explain_advice::Steps {request primitives index} {
  set sentences {}
  foreach {what name unit} {phase phase degrees duty "duty cycle" %} {
    if {[dict get [lindex [dict get $request outputs] $index] $what] eq ""} continue
    foreach {text makers} [::vorkel::explain_steps::nearest $request $primitives $index $what] {
      set whom [lmap maker $makers {::vorkel::explain_calls::told $maker}]
      lappend sentences "output $index: a $name of $text $unit works on\
        [::vorkel::options::enumerate $whom]"
    }
  }
  return $sentences
}

# Sentences on primitives that have settings for an output without its phase, with fractions that
# only best finds and beside which nothing is moved.
proc ::vorkel::explain_advice::Unmoved {request primitives index} {
  if {[dict get [lindex [dict get $request outputs] $index] phase] in {"" 0 0.0}} {
    return {}
  }
  set changed [::vorkel::explain_nearest::with $request $index phase 0]
  set able [lmap primitive [::vorkel::engine::ofFamily Loop $primitives] {
    if {[::vorkel::answer::refusal $changed $primitive] ne "" ||
        ![::vorkel::explain_vcos::isFractional $changed $primitive] ||
        [::vorkel::explain_nearest::isSpent] ||
        [::vorkel::explain_nearest::proof $changed $primitive] ne ""} continue
    set best [lindex [::vorkel::grid::best $changed $primitive] 0]
    if {$best eq "" || ![dict get $best within]} continue
    set primitive
  }]
  return [lmap primitive $able {
    string cat "output $index: a phase of 0 degrees works on the $primitive, with best"
  }]
}

# Frequencies for all outputs at once, when to move those that were tried one at a time is in vain.
# `beyond` is a set that only best finds the settings for, or "".
proc ::vorkel::explain_advice::Together {call sets beyond tried} {
  set which [expr {[llength $tried] > 1 ? "a single one of [outputs [lsort -integer $tried]]" :
    "[outputs $tried] alone"}]
  set vain "to move $which is not enough for the engine's search"
  if {$::vorkel::explain_nearest::stopped || [dict size $::vorkel::explain_nearest::passed] > 0} {
    set vain ""
  }
  if {$beyond ne "" && [::vorkel::explain_nearest::proof [dict get $beyond request] \
      [dict get $beyond primitive]] ne ""} {
    set sets [Inserted $sets $beyond]
    set beyond ""
  }
  set nearer [expr {$beyond ne "" && ([llength $sets] == 0 ||
    [dict get $beyond ppm] < [dict get [lindex $sets 0] ppm])}]
  if {[llength $sets] == 0 && !$nearer} {
    return [expr {$vain eq "" ? "" : "\n[::vorkel::table::prose {} $vain]"}]
  }
  set text \n[::vorkel::table::prose "" \
    "[expr {$vain eq "" ? "" : "$vain; "}]with all the frequencies of one of these it works:"]
  if {$nearer} {
    append text [Set $beyond "[dict get $beyond primitive], which only best finds"]
  }
  foreach set $sets {
    append text [Set $set [::vorkel::explain_calls::label [dict get $set request] \
      [dict get $set primitive]]]
  }
  set first [expr {$nearer ? $beyond : [lindex $sets 0]}]
  return "${text}hint: the first of these: [::vorkel::explain_calls::command \
    [expr {$nearer ? "best" : "plan"}] $call [dict get $call request outputs] \
    [dict get $first texts]]\n"
}

# Sets with another one, which is not there twice, the nearest first.
proc ::vorkel::explain_advice::Inserted {sets set} {
  foreach other $sets {
    if {[dict get $other texts] eq [dict get $set texts]} {
      return $sets
    }
  }
  return [lsort -command {apply {{one other} {
    set difference [expr {[dict get $one ppm] - [dict get $other ppm]}]
    expr {$difference < 0 ? -1 : $difference > 0}
  }}} [list {*}$sets $set]]
}

proc ::vorkel::explain_advice::Set {set whose} {
  return [::vorkel::table::prose "$whose: " "--out [join [dict get $set texts] ,] (at most\
    [far [dict get $set ppm] 0])"]
}

# A frequency with what it is about when that takes a quotient or many digits.
proc ::vorkel::explain_advice::Spelled {near} {
  set text [dict get $near text]
  set short [number [dict get $near frequency]]
  if {$text ne $short} {
    append text " = $short"
  }
  return $text
}

# The outputs that stand in the findings, those of most primitives first.
proc ::vorkel::explain_advice::Offenders {findings} {
  set counts [dict create]
  dict for {primitive found} $findings {
    foreach finding $found {
      foreach index [dict get $finding outputs] {
        dict incr counts $index
      }
    }
  }
  set pairs [lsort -integer -index 0 [lmap {index count} $counts {list $index $count}]]
  return [lmap pair [lsort -integer -decreasing -index 1 $pairs] {lindex $pair 0}]
}

# The input clocks with which the engine's search makes every frequency exact. Where nothing is in
# the way, they are told only to who asks.
proc ::vorkel::explain_advice::inputs {call texts possible} {
  set stock [expr {![dict exists $call given --oscillators]}]
  if {$stock && $possible} {
    return ""
  }
  set found [::vorkel::explain_nearest::oscillators [dict get $call request] \
    [dict get $call primitives] $texts]
  set what [expr {$stock ? "stock oscillators" : "oscillators of your list"}]
  if {[llength $found] == 0 && $::vorkel::explain_nearest::stopped} {
    return ""
  }
  set first [expr {[llength [dict get $call request inputs]] > 1 ?
    " in place of the first input clock" : ""}]
  if {[llength $found] == 0} {
    return "\n[::vorkel::table::prose {} "None of the $what makes every frequency exact$first with\
      the engine's search."]"
  }
  set groups [dict create]
  foreach pair $found {
    lassign $pair text labels
    dict lappend groups $labels $text
  }
  set text \n[::vorkel::table::prose "" "$what that make every frequency exact$first with the\
    engine's search, MHz:"]
  dict for {labels inputs} $groups {
    append text [::vorkel::table::prose "[join $labels {, }]: " [join $inputs {, }]]
  }
  return $text
}

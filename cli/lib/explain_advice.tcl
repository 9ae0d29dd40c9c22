# What explain tells of the requests nearby that would work, as paragraphs and a table.

package provide vorkel::explain_advice 1.1
package require vorkel::answer 1.1
package require vorkel::explain_nearest 1.1
package require vorkel::explain_steps 1.1
package require vorkel::explain_text 1.1
package require vorkel::options 1.1
package require vorkel::table 1.1

namespace eval ::vorkel::explain_advice {
  namespace path ::vorkel::explain_text
  # As many outputs are told what would work for them.
  variable most_outputs 3
}

# The nearest requests for the outputs that something stands in the way of.
proc ::vorkel::explain_advice::nearest {call findings answers} {
  variable most_outputs
  set request [dict get $call request]
  set primitives [dict get $call primitives]
  if {[dict get [lindex $answers 0] within]} {
    return ""
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
    lappend moved {*}$steps
    incr helped [expr {[llength $own] + [llength $steps] > 0}]
  }
  set left [lrange $offenders [llength $tried] end]
  set text ""
  if {[llength $rows] > 0} {
    append text \n [Table $rows $primitives]
  }
  if {$helped == 0} {
    append text [Together [::vorkel::explain_nearest::sets $request $primitives] $tried]
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
      [Outputs $left] has not been searched"]
  }
  return $text
}

# "output 1", "outputs 1, 2 and 3".
proc ::vorkel::explain_advice::Outputs {indices} {
  return "output[expr {[llength $indices] > 1 ? "s" : ""}]\
    [::vorkel::options::enumerate $indices]"
}

# The frequencies that work for an output, as rows of a table.
proc ::vorkel::explain_advice::Rows {request primitives index} {
  return [lmap near [::vorkel::explain_nearest::frequencies $request $primitives $index] {
    list $index [Spelled $near] [far [dict get $near ppm]] \
      [join [dict get $near primitives] {, }]
  }]
}

proc ::vorkel::explain_advice::Table {rows primitives} {
  set which [expr {[llength $primitives] == 1 ? "the nearest two below and above" :
    "the nearest below and above of each primitive"}]
  set columns {{right output} {left {MHz instead}} {right change} {left {made by}}}
  set head [::vorkel::table::prose "" "frequencies nearby that work, all else as asked for;\
    $which:"]
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
      set whom [lmap maker $makers {string cat "the " $maker}]
      lappend sentences "output $index: a $name of $text $unit works on\
        [::vorkel::options::enumerate $whom]"
    }
  }
  return $sentences
}

# Frequencies for all outputs at once, when to move those that were tried one at a time is in vain.
proc ::vorkel::explain_advice::Together {sets tried} {
  set vain "to move [Outputs $tried][expr {[llength $tried] > 1 ? ", one at a time," : " alone"}]\
    does not help"
  if {$::vorkel::explain_nearest::stopped || [dict size $::vorkel::explain_nearest::passed] > 0} {
    set vain ""
  }
  if {[llength $sets] == 0} {
    return [expr {$vain eq "" ? "" : "\n[::vorkel::table::prose {} $vain]"}]
  }
  set text \n[::vorkel::table::prose "" \
    "[expr {$vain eq "" ? "" : "$vain; "}]moved together, these work:"]
  foreach set $sets {
    append text [::vorkel::table::prose "[dict get $set primitive]: " \
      "--out [join [dict get $set texts] ,] (at most\
      [far [dict get $set ppm]])"]
  }
  return $text
}

# A frequency with what it is about when it is written as a quotient.
proc ::vorkel::explain_advice::Spelled {near} {
  set text [dict get $near text]
  if {[string first / $text] >= 0} {
    append text " = [number [dict get $near frequency]]"
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

# The input clocks that would make everything exact. Where nothing is in the way, they are told
# only to who asks.
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
    return "\n[::vorkel::table::prose {} "None of the $what makes every output exact$first."]"
  }
  set groups [dict create]
  foreach pair $found {
    lassign $pair text primitives
    dict lappend groups $primitives $text
  }
  set text \n[::vorkel::table::prose "" "$what that make every output exact$first, MHz:"]
  dict for {primitives inputs} $groups {
    append text [::vorkel::table::prose "[join $primitives {, }]: " [join $inputs {, }]]
  }
  return $text
}

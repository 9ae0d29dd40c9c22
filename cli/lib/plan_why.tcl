# Why plan has put one primitive before the others, in words.

package provide vorkel::plan_why 1.1
package require vorkel::answer 1.1
package require vorkel::cells 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::plan_why {
  namespace path ::vorkel::cells
}

# Why the first of the best answers of each primitive is before the others.
proc ::vorkel::plan_why::of {best ranked} {
  set winner [lindex $best 0]
  set name [dict get $winner primitive]
  set tolerance [::vorkel::numbers::short [dict get $winner request tolerance] 6]
  set near [expr {$tolerance == 0 ? "have exact frequencies" : "are within $tolerance ppm"}]
  set limit [expr {$tolerance == 0 ? "all $near" : "are all within $tolerance ppm"}]
  if {![dict get $winner within]} {
    return [WhyNothing $winner $best]
  }
  set within [Within $best]
  if {[llength $best] == 1} {
    set text "all outputs of the $name $near"
  } elseif {[llength $within] == 1} {
    set text "$name is the only primitive [expr {[IsRivalled $winner $best] ?
      "with everything as asked for and in the device's range" : "whose outputs $limit"}]"
  } else {
    set text "of [Names $within], whose outputs $limit, $name\
      [Advantage $winner [lindex $within 1] "the [dict get [lindex $within 1] primitive]"]"
  }
  set variants [Within [::vorkel::answer::ofPrimitive $ranked $name]]
  if {[llength $variants] > 1} {
    append text ". Of the [llength $variants] settings of the $name, [Described $winner]\
      [Advantage $winner [lindex $variants 1] "the next"]"
  }
  return $text.
}

# Whether the frequencies of another answer, which is not as asked for, are all as near as they must
# be.
proc ::vorkel::plan_why::IsRivalled {winner best} {
  set tolerance [dict get $winner request tolerance]
  foreach answer $best {
    if {[dict get $answer solved] && ![dict get $answer within] &&
        [::vorkel::answer::isAllowed ppm [dict get $answer worstPpm] $tolerance]} {
      return 1
    }
  }
  return 0
}

# The same when not even it is as asked for.
proc ::vorkel::plan_why::WhyNothing {winner best} {
  if {[llength [dict get $winner violations]] > 0} {
    return [WhyOutside $winner]
  }
  set name [dict get $winner primitive]
  set equal [list $winner]
  set decided ""
  set lead "of what there is"
  foreach answer [lrange $best 1 end] {
    if {![dict get $answer solved]} continue
    set by [::vorkel::answer::decided $winner $answer]
    if {$by in {jitter vco ""}} {
      lappend equal $answer
      if {[llength $equal] == 2} {
        set decided $by
      }
    } elseif {$by eq "class"} {
      set lead "of what is in the device's range"
    }
  }
  if {[llength $equal] == 1} {
    return "nothing is as asked for; $lead, the $name has the [Nearest $winner] that are nearest."
  }
  set text "nothing is as asked for; $lead, [Names $equal] come equally near, and the $name "
  switch -- $decided {
    jitter { append text "has the least jitter, [jitter $winner] ps" }
    vco { append text "has, with the same jitter, the lowest VCO, [vco $winner] MHz" }
    default { append text "comes first, with all else the same" }
  }
  return $text.
}

# The same when not even it is in the device's range.
proc ::vorkel::plan_why::WhyOutside {winner} {
  set violations [lassign [dict get $winner violations] first]
  set count [llength $violations]
  if {$count > 0} {
    append first " ($count more such [expr {$count > 1 ? "notes are" : "note is"}] above)"
  }
  return "nothing is as asked for and in the device's range: with the [dict get $winner primitive],\
    $first. What is out of range ranks behind all that is only off, and is marked OFF as that is."
}

# What of an answer that is off is to be as near as it can be.
proc ::vorkel::plan_why::Nearest {answer} {
  set offs [concat {*}[lmap output [dict get $answer outputs] {dict get $output offs}]]
  return [expr {"ppm" in $offs ? "frequencies" : "phaseError" in $offs ? "phases" : "duty cycles"}]
}

# Those answers that are within their tolerance.
proc ::vorkel::plan_why::Within {answers} {
  return [lmap answer $answers {
    if {![dict get $answer within]} continue
    set answer
  }]
}

proc ::vorkel::plan_why::Names {answers} {
  return [::vorkel::options::enumerate [lmap answer $answers {dict get $answer primitive}]]
}

# The variant and the bandwidth of an answer, in words.
proc ::vorkel::plan_why::Described {answer} {
  set parts [list [dict get $answer variant]]
  if {[dict get $answer bandwidth] ne ""} {
    lappend parts "bandwidth [dict get $answer bandwidth]"
  }
  return [join $parts { with }]
}

# What an answer has before another one, both within their tolerance.
proc ::vorkel::plan_why::Advantage {winner other whose} {
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

# Which limits of a PLL or a TSYN stand in the way of a request.
# A finding is a dict; explain_text.tcl tells what is in it.

package provide vorkel::explain_loop 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::explain_ladder 1.1
package require vorkel::explain_shape 1.1
package require vorkel::explain_text 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::hardware 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1
package require vorkel::output_range 1.1

namespace eval ::vorkel::explain_loop {
  namespace path ::vorkel::explain_text
  # As many VCO frequencies are told one by one.
  variable most_named 4
}

# The findings; none when there are settings for all that is asked.
proc ::vorkel::explain_loop::findings {request primitive} {
  set findings [inputs $request $primitive]
  set possible [expr {[llength $findings] == 0}]
  set pairs {}
  if {$possible} {
    set pairs [::vorkel::explain_vcos::pairs $request $primitive [dict get $request inputs]]
  }
  set fractional [::vorkel::explain_vcos::isFractional $request $primitive]
  set index 0
  foreach output [dict get $request outputs] {
    set found [Range $request $primitive $output $index]
    if {[llength $found] == 0 && $possible} {
      set found [Alone $request $primitive $output $index $pairs \
        [expr {$fractional && $index == 0}]]
    }
    lappend findings {*}$found
    incr index
  }
  if {[llength $findings] > 0} {
    return $findings
  }
  return [Together $request $primitive $pairs]
}

# What the input clocks are in the way of by themselves.
proc ::vorkel::explain_loop::inputs {request primitive} {
  set inputs [dict get $request inputs]
  set limits [dict get $request limits]
  set bandwidth [dict get $request bandwidth]
  set pfd [::vorkel::catalogue::pfdRange $primitive $limits $bandwidth]
  set vco [::vorkel::catalogue::vcoRange $primitive $limits]
  set narrow [expr {$bandwidth eq "LOW" ? " with bandwidth LOW" : ""}]
  set findings {}
  foreach input $inputs {
    lassign [::vorkel::explain_vcos::dividersOf $input $pfd] first last
    if {$first > $last} {
      lappend findings [finding "PFD range" {} "the PFD runs at the input divided by D, and must\
        have [number [lindex $pfd 0]] to [number [lindex $pfd 1]] MHz$narrow:\
        [PfdMiss $input $pfd]"]
    } elseif {[llength [::vorkel::explain_vcos::pairs $request $primitive [list $input]]] == 0} {
      lappend findings [finding "VCO range" {} "the VCO must have [number [lindex $vco 0]] to\
        [number [lindex $vco 1]] MHz, and [number $input] MHz x M / D, with whole M up to\
        $::vorkel::hardware::largest_m and D from $first to $last, never has"]
    }
  }
  if {[llength $findings] == 0 && [llength [::vorkel::explain_vcos::pairs $request $primitive \
      $inputs]] == 0} {
    lappend findings [Apart $inputs $vco $pfd]
  }
  return $findings
}

proc ::vorkel::explain_loop::PfdMiss {input range} {
  lassign $range lowest highest
  if {$input < $lowest} {
    return "even with D = 1 it has only the [number $input] MHz of the input"
  }
  set most $::vorkel::hardware::largest_d
  if {$input / double($most) > $highest} {
    return "even with D = $most it has [number [expr {$input / double($most)}]] MHz from an input\
      of [number $input] MHz"
  }
  return "no whole D divides the [number $input] MHz of the input into that"
}

# Two input clocks of which each would do.
proc ::vorkel::explain_loop::Apart {inputs vco pfd} {
  lassign [lsort -real $inputs] slow fast
  set times [expr {double($fast) / $slow}]
  set span [expr {[lindex $vco 1] / [lindex $vco 0]}]
  set text "the same M and D serve both input clocks. [number $fast] MHz is\
    [::vorkel::numbers::short $times 3] times [number $slow] MHz"
  if {$times > $span} {
    append text ", but the highest VCO, [number [lindex $vco 1]] MHz, is only\
      [::vorkel::numbers::short $span 3] times the lowest, [number [lindex $vco 0]] MHz"
  } else {
    append text "; no whole M and D keep the VCO in [number [lindex $vco 0]] to\
      [number [lindex $vco 1]] MHz and the PFD in [number [lindex $pfd 0]] to\
      [number [lindex $pfd 1]] MHz with both"
  }
  return [finding "inputs too far apart" {} $text]
}

# An output that no input clock could help.
proc ::vorkel::explain_loop::Range {request primitive output index} {
  set frequency [dict get $output freq]
  set limits [dict get $request limits]
  lassign [::vorkel::catalogue::outputRange $primitive $limits $index] lowest highest
  if {$frequency < $lowest || $frequency > $highest} {
    set side [expr {$frequency < $lowest ? "below the lowest, [number $lowest]" :
      "above the highest, [number $highest]"}]
    return [list [finding "output range" $index "[number $frequency] MHz is $side MHz"]]
  }
  set second [SecondRange $request $primitive $frequency $index]
  if {$second ne ""} {
    return [list [finding "output range" $index $second]]
  }
  lassign [::vorkel::catalogue::vcoRange $primitive $limits] slow fast
  set most [::vorkel::hardware::largestDivider $limits]
  set allowed [expr {1 + [dict get $request tolerance] * 1e-6}]
  if {$frequency * $most * $allowed < $slow} {
    set needed [expr {int(ceil($slow / $frequency))}]
    set why [expr {$most < $::vorkel::hardware::largest_divider ? ", as its high and low times end\
      at [dict get $limits O_MAX_HT_LT] VCO periods" : ""}]
    return [list [finding "divider range" $index "to make [number $frequency] MHz of the lowest\
      VCO, [number $slow] MHz, the divider would have to be $needed; the largest is $most$why"]]
  }
  set fractional [expr {$index == 0 && [::vorkel::explain_vcos::isFractional $request $primitive]}]
  set steps [expr {$fractional ? $::vorkel::hardware::fraction : 1}]
  set below [expr {floor($fast * $allowed / $frequency * $steps) / $steps}]
  # There is no divider between 1 and 2.
  if {$below < 2} {
    set below [expr {floor($below)}]
  }
  if {$below < 1 || $below * $frequency * $allowed < $slow} {
    set above [expr {$below < 2 ? $below + 1 : $below + 1.0 / $steps}]
    set parts [lmap divider [list $below $above] {
      if {$divider < 1} continue
      string cat "[::vorkel::numbers::short $divider 3] needs a VCO of " \
        "[number [expr {$divider * $frequency}]] MHz"
    }]
    return [list [finding "VCO range" $index "for [number $frequency] MHz a divider of\
      [join $parts {, one of }], and the range of the VCO is [number $slow] to [number $fast] MHz"]]
  }
  return {}
}

# That an output leaves its range with the second input clock, or "".
proc ::vorkel::explain_loop::SecondRange {request primitive frequency index} {
  lassign [dict get $request inputs] first second
  lassign [::vorkel::output_range::of $request $primitive $index \
    [expr {$frequency * $::vorkel::explain_vcos::rounding}]] lowest highest
  if {$second eq "" || ($frequency >= $lowest && $frequency <= $highest)} {
    return ""
  }
  lassign [::vorkel::catalogue::outputRange $primitive [dict get $request limits] $index] low high
  set other [expr {double($frequency) * $second / $first}]
  set side [expr {$other < $low ? "below the lowest, [number $low]" :
    "above the highest, [number $high]"}]
  return "[number $frequency] MHz from the first input is [number $other] MHz from the second,\
    $side MHz"
}

# An output that cannot be made even when it is the only one.
proc ::vorkel::explain_loop::Alone {request primitive output index pairs fractional} {
  set level 0
  set serving {}
  foreach pair $pairs {
    set reached [::vorkel::explain_vcos::level $request $output [lindex $pair 0] $fractional]
    set level [expr {max($level, $reached)}]
    if {$reached > 0} {
      lappend serving $pair
    }
  }
  switch -- $level {
    0 { return [list [Grid $request $primitive $output $index $fractional]] }
    1 { return [list [::vorkel::explain_shape::phase $output $index $serving]] }
    2 { return [list [::vorkel::explain_shape::duty $request $output $index $serving]] }
  }
  return {}
}

# M and D do not make the VCO that the output needs.
proc ::vorkel::explain_loop::Grid {request primitive output index fractional} {
  set frequency [dict get $output freq]
  set limits [dict get $request limits]
  set whole [expr {$fractional ? "a divider in eighths" : "a whole number"}]
  set text "[number $frequency] MHz is the VCO divided by $whole"
  if {!$fractional} {
    append text [NamedVcos $frequency [::vorkel::catalogue::vcoRange $primitive $limits]]
  }
  append text ", but [Makes $request $primitive "no such VCO"].\
    [nearestMade $request $primitive $index]"
  return [finding "M and D" $index $text[NoObstacle $output \
    [::vorkel::catalogue::vcoRange $primitive $limits]]]
}

# What was asked for beside the frequency, when some divider has it.
proc ::vorkel::explain_loop::NoObstacle {output range} {
  set phase [dict get $output phase]
  if {$phase in {"" 0 0.0}} {
    return ""
  }
  lassign $range lowest highest
  set frequency [dict get $output freq]
  set divider [expr {max(1, int(ceil($lowest / $frequency)))}]
  for {} {$divider * $frequency <= $highest} {incr divider} {
    if {[::vorkel::explain_vcos::phaseServes $output $divider]} {
      return ". The phase is not in the way: a divider of $divider has [number $phase] degrees"
    }
  }
  return ""
}

# The VCO frequencies that a frequency is a part of, if they are few.
proc ::vorkel::explain_loop::NamedVcos {frequency range} {
  variable most_named
  lassign $range lowest highest
  set vcos {}
  for {set n [expr {max(1, int(ceil($lowest / $frequency)))}]} {$n * $frequency <= $highest} \
      {incr n} {
    lappend vcos [number [expr {$n * $frequency}]]
  }
  if {[llength $vcos] == 0 || [llength $vcos] > $most_named} {
    return ""
  }
  return " (a VCO of [::vorkel::options::enumerate $vcos or] MHz)"
}

# That M and D do not make a VCO that is needed, and what there is of them.
proc ::vorkel::explain_loop::Makes {request primitive what} {
  set whose [expr {[::vorkel::explain_vcos::isSearchWhole $request $primitive] ?
    "the engine's search, with whole M, makes $what of" : ""}]
  set input "[number [lindex [dict get $request inputs] 0]] MHz x M / D"
  return "[expr {$whose eq "" ? "$input makes $what" : "$whose $input"}]: [MostM $primitive],\
    and D ends at [LargestD $request $primitive]"
}

proc ::vorkel::explain_loop::MostM {primitive} {
  set most $::vorkel::hardware::largest_m
  set smallest [dict get $::vorkel::hardware::smallest_m $primitive]
  return [expr {$smallest == 1 ? "M ends at $most" : "M is 1 or $smallest to $most"}]
}

proc ::vorkel::explain_loop::LargestD {request primitive} {
  set range [::vorkel::catalogue::pfdRange $primitive [dict get $request limits] \
    [dict get $request bandwidth]]
  set last $::vorkel::hardware::largest_d
  set text $last
  foreach input [dict get $request inputs] {
    set high [lindex [::vorkel::explain_vcos::dividersOf $input $range] 1]
    if {$high < $last} {
      set last $high
      set text "$high, as the PFD needs [number [lindex $range 0]] MHz"
    }
  }
  return $text
}

# The nearest frequencies below and above that a primitive makes in the range of an output,
# whatever the other outputs are, as a sentence without its full stop.
proc ::vorkel::explain_loop::nearestMade {request primitive index} {
  set near {}
  foreach side {below above} {
    set search [::vorkel::explain_ladder::search $request $primitive $index $side 1]
    set rung [::vorkel::explain_ladder::next search]
    if {$rung ne ""} {
      lappend near $rung
    }
  }
  set frequency [dict get [lindex [dict get $request outputs] $index] freq]
  set texts [lmap rung [lsort -real -index 0 $near] {
    string cat "[number [lindex $rung 1]] MHz ([How $request $rung],\
      [change [lindex $rung 1] $frequency])"
  }]
  set whose [expr {[::vorkel::explain_vcos::isSearchWhole $request $primitive] ?
    " that it makes" : ""}]
  switch -- [llength $texts] {
    0 { return "It makes nothing that is in range" }
    1 { return "The nearest$whose is [lindex $texts 0]" }
  }
  return "The nearest$whose are [join $texts { and }]"
}

# How a rung of explain_ladder.tcl is made.
proc ::vorkel::explain_loop::How {request rung} {
  set place [lindex $rung 2]
  if {![string is double [lindex $place 0]]} {
    return "[lindex $place 0]: [lindex $place 1]"
  }
  lassign $place vco m d divider
  return "[number [lindex [dict get $request inputs] 0]] x $m / $d /\
    [::vorkel::numbers::short $divider 3]"
}

# Outputs of which each can be made, but not with the others.
proc ::vorkel::explain_loop::Together {request primitive pairs} {
  set masks [::vorkel::explain_vcos::masks $request $primitive $pairs]
  set indices [::vorkel::answer::indices $request]
  if {[::vorkel::explain_vcos::serving $masks $indices] != 0} {
    return {}
  }
  # What can be left out without making it possible has no part in it.
  foreach index $indices {
    set others [lsearch -all -inline -not -exact $indices $index]
    if {[::vorkel::explain_vcos::serving $masks $others] == 0} {
      set indices $others
    }
  }
  return [list [finding "outputs together" $indices [Conflict $request $primitive $indices]]]
}

proc ::vorkel::explain_loop::Conflict {request primitive indices} {
  set outputs [dict get $request outputs]
  set names [lmap index $indices {number [dict get [lindex $outputs $index] freq]}]
  set text "each can be made alone, but [::vorkel::options::enumerate $names] MHz need one VCO that\
    serves all of them. "
  set range [::vorkel::catalogue::vcoRange $primitive [dict get $request limits]]
  set common [commonVcos $request $primitive $indices $range]
  if {[llength $common] == 0} {
    return [append text "None from [number [lindex $range 0]] to [number [lindex $range 1]] MHz,\
      whatever the input clock, is [Multiple $request $primitive $indices]"]
  }
  set what [expr {[llength $common] == 1 ? "no such VCO" : "none of these"}]
  return [append text "That can [Vcos $common], and [Makes $request $primitive $what]"]
}

# What a VCO that serves these outputs is.
proc ::vorkel::explain_loop::Multiple {request primitive indices} {
  set text "a whole multiple of all of them"
  if {[lindex $indices 0] == 0 && [::vorkel::explain_vcos::isFractional $request $primitive]} {
    append text ", in eighths of output 0,"
  }
  foreach {what words} {phase "their phases" duty "their duty cycles"} {
    foreach index $indices {
      if {[dict get [lindex [dict get $request outputs] $index] $what] ne ""} {
        lappend steps $words
        break
      }
    }
  }
  if {[info exists steps]} {
    append text " that has [join $steps { and }]"
  }
  return [string trimright $text ,]
}

# The VCO frequencies in the range that would serve these outputs.
proc ::vorkel::explain_loop::commonVcos {request primitive indices range} {
  lassign $range lowest highest
  set fractional [::vorkel::explain_vcos::isFractional $request $primitive]
  set seed [lindex [dict get $request outputs] [lindex $indices 0]]
  set steps [expr {$fractional && [lindex $indices 0] == 0 ? $::vorkel::hardware::fraction : 1}]
  set vcos {}
  set most [expr {[::vorkel::hardware::largestDivider [dict get $request limits]] * $steps}]
  for {set n $steps} {$n <= $most} {incr n} {
    set vco [expr {[dict get $seed freq] * double($n) / $steps}]
    if {$vco < $lowest || $vco > $highest || ($n > $steps && $n < 2 * $steps)} continue
    set serves 1
    foreach index $indices {
      set output [lindex [dict get $request outputs] $index]
      if {[::vorkel::explain_vcos::level $request $output $vco \
          [expr {$fractional && $index == 0}]] < 3} {
        set serves 0
        break
      }
    }
    if {$serves} {
      lappend vcos $vco
    }
  }
  return $vcos
}

# What a VCO can be, of at least one frequency, in words.
proc ::vorkel::explain_loop::Vcos {vcos} {
  variable most_named
  set names [lmap vco $vcos {number $vco}]
  if {[llength $names] == 1} {
    return "only be [lindex $names 0] MHz"
  }
  set more [expr {[llength $names] - $most_named}]
  if {$more > 1} {
    return "be [join [lrange $names 0 $most_named-1] {, }] MHz or one of $more more"
  }
  return "be [::vorkel::options::enumerate $names or] MHz"
}

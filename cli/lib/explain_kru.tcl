# Which limits of a KRU_SP or a KRU_CLKGEN stand in the way of a request. The findings are those
# of explain_text.tcl.

package provide vorkel::explain_kru 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::explain_loop 1.1
package require vorkel::explain_pins 1.1
package require vorkel::explain_text 1.1
package require vorkel::explain_vcos 1.1
package require vorkel::hardware 1.1
package require vorkel::kru_phases 1.1
package require vorkel::numbers 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::explain_kru {
  namespace path ::vorkel::explain_text
  # The pins that have ranges of their own, and those that a KRU_CLKGEN has for output 0.
  variable ranged {KRU_SP {CLK0 CLK90 CLK2X CLKDV CLKFX} KRU_CLKGEN CLKFX}
}

# The findings; none when all outputs are possible.
proc ::vorkel::explain_kru::findings {request primitive} {
  set findings {}
  set index 0
  foreach output [dict get $request outputs] {
    lappend findings {*}[Alone $request $primitive $output $index]
    incr index
  }
  if {[llength $findings] == 0 && [llength [dict get $request outputs]] > 1} {
    return [Together $request $primitive]
  }
  return $findings
}

# A request with only some of the outputs, and no duty cycles, for which a KRU has no setting.
proc ::vorkel::explain_kru::Part {request indices} {
  dict set request outputs [lmap index $indices {
    dict replace [lindex [dict get $request outputs] $index] duty ""
  }]
  return $request
}

# Whether the engine has an answer within the tolerance.
proc ::vorkel::explain_kru::Works {request primitive} {
  foreach answer [::vorkel::answer::all $request [list $primitive]] {
    if {[dict get $answer within]} {
      return 1
    }
  }
  return 0
}

# What pins make within the tolerance of a frequency, whatever their ranges: lists of the
# distance, the frequency, the pin and how it is made, the nearest first.
proc ::vorkel::explain_kru::fitting {request primitive frequency} {
  set allowed [expr {$frequency * [::vorkel::explain_vcos::allowed $request]}]
  set rows {}
  foreach {place value} [::vorkel::explain_pins::places $request $primitive $frequency] {
    set distance [expr {abs($value - $frequency)}]
    if {$distance <= $allowed} {
      lappend rows [list $distance $value {*}[lrange $place 0 1]]
    }
  }
  return [lsort -real -index 0 $rows]
}

proc ::vorkel::explain_kru::IsInRange {request primitive pin frequency} {
  lassign [::vorkel::explain_pins::pinRange $request $primitive $pin] lowest highest
  return [expr {$frequency >= $lowest * (1 - 1e-9) && $frequency <= $highest * (1 + 1e-9)}]
}

# Those of some pins whose range holds a frequency.
proc ::vorkel::explain_kru::Holding {request primitive pins frequency} {
  return [lmap pin $pins {
    if {![IsInRange $request $primitive $pin $frequency]} continue
    set pin
  }]
}

# Why an output cannot be made by itself, if so. On a KRU_CLKGEN all follow output 0.
proc ::vorkel::explain_kru::Alone {request primitive output index} {
  set clkgen [expr {$primitive eq "KRU_CLKGEN"}]
  if {$clkgen && $index > 0} {
    return [Follower $request $output $index]
  }
  if {[Works [Part $request $index] $primitive]} {
    return {}
  }
  variable ranged
  set frequency [dict get $output freq]
  set fitting [fitting $request $primitive $frequency]
  if {[llength $fitting] == 0} {
    set findings {}
    set all [dict get $ranged $primitive]
    if {[llength [Holding $request $primitive $all $frequency]] == 0} {
      lappend findings [NoRange $request $primitive $frequency $index $all "every pin"]
    }
    lappend findings [NoRatio $request $primitive $index]
    if {$clkgen && [Phase $output] != 0} {
      lappend findings [NoPhase $request $primitive $output $index CLKFX]
    }
    return $findings
  }
  set candidates [lsort -unique [lmap row $fitting {lindex $row 2}]]
  # CLK90 and CLK270 have a range of their own.
  set phase [Phase $output]
  set quarter [expr {!$clkgen && fmod($phase, 180.0) != 0 && fmod($phase, 90.0) == 0}]
  if {$quarter && "CLK0" in $candidates} {
    set candidates [list CLK90]
  }
  set pins [Holding $request $primitive $candidates $frequency]
  if {[llength $pins] == 0} {
    set findings [list [NoRange $request $primitive $frequency $index $candidates \
      "the pins that could make it"]]
    if {$clkgen && $phase != 0} {
      lappend findings [NoPhase $request $primitive $output $index CLKFX]
    }
    return $findings
  }
  set plain [Part $request $index]
  dict set plain outputs [list [dict replace $output phase "" duty ""]]
  if {![Works $plain $primitive]} {
    foreach row $fitting {
      if {[lindex $row 2] in $pins} break
    }
    return [list [Inexact $primitive $frequency $index $row]]
  }
  return [list [NoPhase $request $primitive $output $index $pins]]
}

# The phase of an output, from 0 to 360 degrees; 0 when it asks for none.
proc ::vorkel::explain_kru::Phase {output} {
  set phase [dict get $output phase]
  if {$phase eq ""} {
    return 0.0
  }
  return [::vorkel::actual::turned $phase]
}

proc ::vorkel::explain_kru::NoRatio {request primitive index} {
  set frequency [dict get [lindex [dict get $request outputs] $index] freq]
  set most [dict get $::vorkel::hardware::kru_largest $primitive]
  set pins "CLKFX makes input x M / D, with M from $::vorkel::hardware::kru_smallest_m and D from\
    1 up to $most"
  if {$primitive eq "KRU_SP"} {
    set pins "CLK0 is the input, CLK2X doubles it, CLKDV divides it by 2 to 8 in halves\
      or by 9 to 17 (behind a half its duty cycle is below 50 %), $pins; the input can be halved\
      before that"
  }
  return [finding "pin frequency" $index "no pin makes\
    [number $frequency] MHz: $pins.\
    [::vorkel::explain_loop::nearestMade $request $primitive $index]"]
}

# The frequency is in the range of none of some pins. `whose` says what these are.
proc ::vorkel::explain_kru::NoRange {request primitive frequency index pins whose} {
  set ranges [lmap pin $pins {
    lassign [::vorkel::explain_pins::pinRange $request $primitive $pin] lowest highest
    string cat "$pin only from [number $lowest] to\
      [number $highest] MHz"
  }]
  set text "[number $frequency] MHz is out of the range of $whose:\
    [join $ranges {; }]"
  return [finding "pin range" $index \
    $text[Narrowed $request $primitive $frequency $pins]]
}

# That a range ends where the engine's does, before the device's, or "".
proc ::vorkel::explain_kru::Narrowed {request primitive frequency pins} {
  if {$primitive ne "KRU_CLKGEN"} {
    return ""
  }
  foreach pin $pins {
    lassign [::vorkel::catalogue::pinRange $pin 0 [dict get $request limits]] lowest highest
    lassign [dict get $::vorkel::catalogue::clkgen_ranges $pin] low high
    if {($frequency > $high && $highest > $high) || ($frequency < $low && $lowest < $low)} {
      return ". The device has $pin from [number $lowest] to\
        [number $highest] MHz, but the engine looks for a $primitive only\
        from [number $low] to [number $high] MHz"
    }
  }
  return ""
}

# The engine does not use the tolerance that is allowed.
proc ::vorkel::explain_kru::Inexact {primitive frequency index row} {
  lassign $row distance value pin how
  return [finding "the engine" $index "$pin could make\
    [number $value] MHz ($how,\
    [change $value $frequency]), but the engine\
    takes settings of a $primitive only where they make the frequency almost exactly"]
}

# What a pin that could make an output has for phases.
proc ::vorkel::explain_kru::NoPhase {request primitive output index pins} {
  set frequency [number [dict get $output freq]]
  set phase [dict get $output phase]
  if {$primitive eq "KRU_CLKGEN"} {
    return [finding "pin phase" $index "output 0 is on CLKFX, at 0 degrees\
      whatever is asked for; [number $phase] degrees is for other outputs, of\
      which CLKFX180 has 180"]
  }
  set known {CLK0 {0 180} CLK90 {90 270} CLK2X {0 180} CLKDV 0 CLKFX {0 180}}
  set texts [lmap pin $pins {
    string cat "$pin has [join [dict get $known $pin] { and }]"
  }]
  set part [Part $request $index]
  foreach answer [::vorkel::answer::all $part [list $primitive]] {
    if {![dict get $answer solved]} continue
    set made [lindex [dict get $answer outputs] 0]
    if {"phaseError" in [dict get $made offs]} {
      return [finding "phase grid" $index "PHASE_SHIFT moves all pins in\
        steps of 360 / $::vorkel::actual::shift_steps =\
        [::vorkel::numbers::short [expr {360.0 / $::vorkel::actual::shift_steps}] 3] degrees: next\
        to [number $phase] degrees it makes\
        [::vorkel::numbers::short [dict get $made phase] 3], off by\
        [::vorkel::numbers::short [expr {abs([dict get $made phaseError])}] 3] with\
        $::vorkel::answer::phase_tolerance allowed"]
    }
  }
  return [finding "pin phase" $index "the pins that make $frequency MHz\
    have no phase of [number $phase] degrees, not even with PHASE_SHIFT, which with feedback ends\
    at [::vorkel::numbers::short [lindex [shifts 90.0] end] 3] degrees: [join $texts {; }]"]
}

# The phases that PHASE_SHIFT adds to those of pins that are so many degrees apart.
proc ::vorkel::explain_kru::shifts {quarter} {
  set shifts {}
  for {set step 0} {$step <= [::vorkel::kru_phases::lastStep $quarter]} {incr step} {
    lappend shifts [expr {$step * 360.0 / $::vorkel::actual::shift_steps}]
  }
  return $shifts
}

# Why an output of a KRU_CLKGEN cannot follow output 0, if so.
proc ::vorkel::explain_kru::Follower {request output index} {
  set divides $::vorkel::hardware::clkgen_divides
  if {[Works [Part $request [list 0 $index]] KRU_CLKGEN]} {
    return {}
  }
  set frequency [dict get $output freq]
  set first [dict get [lindex [dict get $request outputs] 0] freq]
  set text "[number $frequency] MHz"
  set allowed [::vorkel::explain_vcos::allowed $request]
  set divide ""
  foreach candidate [list 1 {*}$divides] {
    if {abs($first / $candidate / $frequency - 1) <= $allowed} {
      set divide $candidate
    }
  }
  if {$divide eq ""} {
    return [list [finding "pin frequency" $index "$text is neither that of\
      output 0, [number $first] MHz, for CLKFX and CLKFX180, nor that divided\
      by [::vorkel::options::enumerate $divides or] for CLKFXDV"]]
  }
  # Whatever else there is may be for want of output 0.
  if {![Works [Part $request 0] KRU_CLKGEN]} {
    return {}
  }
  set pin [expr {$divide == 1 ? "CLKFX" : "CLKFXDV"}]
  if {![IsInRange $request KRU_CLKGEN $pin $frequency]} {
    return [list [NoRange $request KRU_CLKGEN $frequency $index [list $pin] \
      "the pin that could make it"]]
  }
  set phase [dict get $output phase]
  if {$phase ne "" && $phase != 0} {
    set known [expr {$divide == 1 ? "CLKFX has 0 degrees and CLKFX180 180" :
      "CLKFXDV has 0 degrees only"}]
    return [list [finding "pin phase" $index "$text is a frequency of $pin,\
      but [number $phase] degrees is none of its phases: $known"]]
  }
  return [list [finding "the engine" $index "$pin could make $text, but the\
    engine finds no M and D for it that are near enough"]]
}

# Outputs that are possible each by itself, or beside output 0.
proc ::vorkel::explain_kru::Together {request primitive} {
  set indices [::vorkel::answer::indices $request]
  if {[Works [Part $request $indices] $primitive]} {
    return {}
  }
  foreach index $indices {
    set others [lsearch -all -inline -not -exact $indices $index]
    # Whatever follows output 0 of a KRU_CLKGEN is nothing without it.
    if {$primitive eq "KRU_CLKGEN" && $index == 0} continue
    if {[llength $others] > 0 && ![Works [Part $request $others] $primitive]} {
      set indices $others
    }
  }
  if {$primitive eq "KRU_CLKGEN"} {
    return [list [finding "outputs together" $indices "each can be made\
      beside output 0, but one M, one D and one divide of CLKFXDV must serve them all"]]
  }
  set plain $request
  dict set plain outputs [lmap index $indices {
    dict replace [lindex [dict get $request outputs] $index] phase "" duty ""
  }]
  set phases [Works $plain $primitive]
  set offsets [lsort -unique [lmap index $indices {
    set output [lindex [dict get $request outputs] $index]
    if {[dict get $output phase] eq ""} continue
    ::vorkel::numbers::short [expr {fmod([Phase $output], 90.0)}] 3
  }]]
  if {$phases && [llength $offsets] > 1} {
    return [list [finding "pin phase" $indices "one PHASE_SHIFT moves all\
      outputs, on top of the 0, 90, 180 and 270 degrees of the pins; these phases would need\
      [::vorkel::options::enumerate $offsets] degrees of it"]]
  }
  if {$phases} {
    set free [lmap index $indices {
      if {[dict get [lindex [dict get $request outputs] $index] phase] ne ""} continue
      set index
    }]
    set what [expr {[llength $free] == 0 ? "no pins have these phases together" :
      "the pins that are left for [outputs $free], whatever the phase there, do not go with the\
      other phases"}]
    return [list [finding "pin phase" $indices "$what: beside one PHASE_SHIFT for all, the pins at\
      the input frequency have 0, 90, 180 and 270 degrees, CLK2X and CLKFX 0 and 180, CLKDV 0"]]
  }
  return [list [finding "outputs together" $indices "each can be made\
    alone, but one CLKIN_DIVIDE_BY_2, one M and D of CLKFX and one divide of CLKDV must serve\
    them all"]]
}

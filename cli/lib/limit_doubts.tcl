# Limits of a device that cannot be meant: ranges whose ends are the wrong way round, counts that
# are not whole. The engine takes them as they are.

package provide vorkel::limit_doubts 1.1
package require vorkel::catalogue 1.1
package require vorkel::hardware 1.1

namespace eval ::vorkel::limit_doubts {
  # Limits that go together: what is to be the lower one, the higher one, what there is none of
  # when they are the wrong way round, and the primitives that then can do nothing.
  variable pairs {
    VCOCLK_FREQ_MIN VCOCLK_FREQ_MAX "VCO frequency" PLL
    CLKPFD_FREQ_MIN CLKPFD_FREQ_MAX "PFD frequency" PLL
    CLKOUT_FREQ_MIN_GCLK CLKOUT_FREQ_MAX_GCLK "output frequency" PLL
    CLKOUT_FREQ_MIN_GCLK CLKOUT_FREQ_MAX_IOCLK "frequency of output 1" {}
    TSYN_VCOCLK_FREQ_MIN TSYN_VCOCLK_FREQ_MAX "VCO frequency" TSYN
    TSYN_VCOCLK_FREQ_MIN TSYN_VCOCLK_FREQ_TARGET "VCO frequency that is recommended" {}
    TSYN_VCOCLK_FREQ_TARGET TSYN_VCOCLK_FREQ_MAX "VCO frequency that is recommended" {}
    TSYN_CLKOUT_FREQ_MIN TSYN_CLKOUT_FREQ_MAX "output frequency" TSYN
    TSYN_CLKPFD_FREQ_MIN TSYN_CLKPFD_FREQ_MAX "PFD frequency" TSYN
    TSYN_CLKPFD_FREQ_MIN TSYN_CLKPFD_FREQ_MAX_LBW "PFD frequency with a narrow loop" {}
  }
  # The pin of a KRU without which a primitive has none.
  variable needed_pins {CLKFX KRU_CLKGEN}
}

# What is doubtful about the limits of a grade, a dict from keyword to number: a list of dicts
#   keyword   the limit that the user may look at first
#   sentence  what is wrong
#   none      what there is none of, or ""
#   touched   the primitives that it concerns
#   lost      those of them that can do nothing with such limits
proc ::vorkel::limit_doubts::of {limits} {
  set doubts {}
  foreach {low high what lost} [Pairs] {
    if {![dict exists $limits $low] || ![dict exists $limits $high] ||
        [dict get $limits $low] <= [dict get $limits $high]} continue
    lappend doubts [dict create keyword $low sentence "$low, [dict get $limits $low], is above\
      $high, [dict get $limits $high]: there is no $what" none $what touched [Users $low $limits] \
      lost $lost]
  }
  foreach keyword [::Vorkel::Devices keywords] {
    lassign $keyword name unit
    if {$unit ne "count" || ![dict exists $limits $name]} continue
    set count [dict get $limits $name]
    set largest [::vorkel::hardware::largestDivider $limits]
    if {$name eq "O_MAX_HT_LT" && $largest < $::vorkel::hardware::largest_divider} {
      lappend doubts [dict create keyword $name sentence "$name, $count, is so low that no divider\
        can be above [expr {$largest > 1 ? "twice that, $largest" : $largest}]: its high and low\
        times do not fit; the engine takes up to $::vorkel::hardware::largest_divider all the same"\
        none {} touched [Users $name $limits] lost {}]
    }
    if {$count == floor($count)} continue
    lappend doubts [dict create keyword $name sentence "$name, $count, is a count of VCO cycles\
      and should be a whole number" none {} touched [Users $name $limits] lost {}]
  }
  return $doubts
}

# The variable pairs, and the shortest and longest periods of the pins of a KRU.
proc ::vorkel::limit_doubts::Pairs {} {
  variable pairs
  variable needed_pins
  set all $pairs
  foreach keyword [::Vorkel::Devices keywords] {
    set name [lindex $keyword 0]
    if {[regexp {^D_KRU_([^_]+)_.*_MINPERIOD$} $name -> pin]} {
      set lost [expr {[dict exists $needed_pins $pin] ? [dict get $needed_pins $pin] : ""}]
      # The longest period of a pin is the same for both feedbacks.
      lappend all $name [string map {_2X_ _1X_ MINPERIOD MAXPERIOD} $name] "period of $pin" $lost
    }
  }
  return $all
}

# The primitives that need a keyword, among those whose limits are all there.
proc ::vorkel::limit_doubts::Users {name limits} {
  return [lmap primitive [::vorkel::catalogue::primitivesOf $limits] {
    if {$name ni [lmap keyword [::vorkel::catalogue::keywordsOf $primitive] {lindex $keyword 0}]} {
      continue
    }
    set primitive
  }]
}

# The M, D and bandwidths of a PLL or a TSYN, gone through for those that can be the best or a
# trade-off (see grid.tcl).
#
# M is counted in parts, as a divider is: in eighths, or whole. A group is a dict of what the
# device's ranges allow:
#   bandwidths   those with which these M and D can be used
#   rows         a list, for each D from the smallest one on D and its spans; a span is the first
#                and the last count of M, and the spans with the largest M come first

package provide vorkel::grid_loops 1.1
package require vorkel::actual 1.1
package require vorkel::answer 1.1
package require vorkel::catalogue 1.1
package require vorkel::grid_dividers 1.1
package require vorkel::hardware 1.1
package require vorkel::notes 1.1

namespace eval ::vorkel::grid_loops {
  # Errors of frequencies, as fractions, are worked out here in a quick way. Two that are more
  # apart than this are so after all rounding, too; one millionth of a ppm is the last digit that
  # counts.
  variable close 2e-12
  variable relatively_close 1e-13
  # Likewise for M / D^2.
  variable apart [expr {1 + 1e-9}]
}

# The groups of a primitive that have an M and a D at all.
proc ::vorkel::grid_loops::groups {request primitive parts} {
  set limits [dict get $request limits]
  set inputs [dict get $request inputs]
  set alike [dict create]
  foreach bandwidth [::vorkel::answer::widths $request] {
    dict lappend alike [::vorkel::catalogue::pfdRange $primitive $limits $bandwidth] $bandwidth
  }
  set vcos [Wide [::vorkel::catalogue::vcoRange $primitive $limits]]
  set groups [dict create]
  dict for {pfds bandwidths} $alike {
    set rows [Rows $inputs $vcos [Wide $pfds] $primitive $parts]
    if {[llength $rows] > 0} {
      dict lappend groups $rows {*}$bandwidths
    }
  }
  return [lmap {rows bandwidths} $groups {dict create bandwidths $bandwidths rows $rows}]
}

proc ::vorkel::grid_loops::Rows {inputs vcos pfds primitive parts} {
  set rows {}
  for {set d 1} {$d <= $::vorkel::hardware::largest_d} {incr d} {
    if {![AreInside $inputs 1 $d $pfds]} continue
    set spans [Spans $inputs $vcos $d $primitive $parts]
    if {[llength $spans] > 0} {
      lappend rows [list $d $spans]
    }
  }
  return $rows
}

# The spans of M that go with a D.
proc ::vorkel::grid_loops::Spans {inputs vcos d primitive parts} {
  lassign $vcos lowest highest
  set first $parts
  set end [expr {$::vorkel::hardware::largest_m * $parts}]
  set last $end
  foreach input $inputs {
    # One further out, as these quotients are rounded; VCOs tell what is inside.
    set count [expr {double($parts) * $d / $input}]
    set first [expr {max($first, int(floor(min($lowest * $count, $end + 1.0))) - 1)}]
    set last [expr {min($last, int(ceil(min($highest * $count, $end + 1.0))) + 1)}]
  }
  while {$first <= $last && ![AreInside $inputs [expr {double($first) / $parts}] $d $vcos]} {
    incr first
  }
  while {$last >= $first && ![AreInside $inputs [expr {double($last) / $parts}] $d $vcos]} {
    incr last -1
  }
  set spans [list [list $first $last]]
  set smallest [dict get $::vorkel::hardware::smallest_m $primitive]
  if {$smallest > 1} {
    set spans [list [list [expr {max($first, $smallest * $parts)}] $last] \
      [list $first [expr {min($last, $parts)}]]]
  }
  return [lmap span $spans {
    if {[lindex $span 0] > [lindex $span 1]} continue
    set span
  }]
}

# A range with what its limits are off by the rounding of the arithmetic, as the notes on an
# answer have it.
proc ::vorkel::grid_loops::Wide {range} {
  lassign $range lowest highest
  return [list [expr {$lowest - $::vorkel::notes::rounding}] \
    [expr {$highest + $::vorkel::notes::rounding}]]
}

proc ::vorkel::grid_loops::AreInside {inputs m d range} {
  lassign $range lowest highest
  foreach input $inputs {
    set frequency [expr {double($input) * $m / $d}]
    if {$frequency < $lowest || $frequency > $highest} {
      return 0
    }
  }
  return 1
}

# The M (a count of parts) and D of a group that have a divider for each target with an error of
# at most `most` ppm, and that can be the best or a trade-off. `targets` are those for a whole M
# and those for another one.
#
# Left out is what has a larger error of the frequency than another M and D, and no less jitter.
# The worst of the errors with the nearest dividers is what an M and a D come to, whatever is asked
# for beside it, as the frequency counts first. As to the jitter: the input and the bandwidth
# determine it but for the part of the oscillator, whose variance is inversely proportional to the
# frequencies of VCO and PFD (doc/calculator.md), and so to their product, input^2 * M / D^2. So
# it rises nowhere when M / D^2 does, and each bandwidth of the group goes with both. Of the same
# M / D, which is the same VCO with the same dividers, that with the smallest D has the least
# jitter, and is before the others where that is the same or not known. A whole M and another one
# can differ in the dividers that go with them, and are kept apart.
proc ::vorkel::grid_loops::survivors {input parts group targets most tick} {
  variable close
  variable relatively_close
  variable apart
  set candidates [Candidates $input $parts $group $targets $most $tick]
  set reached 0.0
  set passed 0
  set smallest [dict create]
  foreach candidate $candidates {
    lassign $candidate error count d key
    # Those whose error is smaller for certain.
    while {[lindex $candidates $passed 0] * (1 + $relatively_close) + $close < $error} {
      set reached [expr {max($reached, [lindex $candidates $passed 3])}]
      incr passed
    }
    if {$reached >= $key * $apart} continue
    set ratio [list [::vorkel::actual::reduce $count $d] [expr {$count % $parts == 0}]]
    if {![dict exists $smallest $ratio] || [lindex [dict get $smallest $ratio] 1] > $d} {
      dict set smallest $ratio [list $count $d]
    }
  }
  return [dict values $smallest]
}

# The VCO, MHz, to within the rounding of the arithmetic.
proc ::vorkel::grid_loops::vco {input count parts d} {
  return [expr {double($input) * $count / ($parts * $d)}]
}

# The first sieve, which need not work out all errors to the end: a list of error, count of M, D and
# M / D^2, the smallest error first. M falls within a row, and with it M / D^2; what has a larger
# error than something before it in the row, or than something in a row whose M / D^2 are all larger
# than those of this one, is not in the list.
proc ::vorkel::grid_loops::Candidates {input parts group targets most tick} {
  variable close
  variable relatively_close
  variable apart
  set candidates {}
  # For each row that is done its smallest M / D^2 and its smallest error.
  set done {}
  lassign [lmap list $targets {::vorkel::grid_dividers::outline $list}] whole fraction
  foreach row [dict get $group rows] {
    lassign $row d spans
    set square [expr {double($parts) * $d * $d}]
    set top [expr {[lindex $spans 0 1] / $square * $apart}]
    set least [expr {$most * 1e-6}]
    foreach {key error} $done {
      if {$key >= $top && $error < $least} {
        set least $error
      }
    }
    foreach span $spans {
      lassign $span first last
      for {set count $last} {$count >= $first} {incr count -1} {
        set error [Error [vco $input $count $parts $d] \
          [expr {$count % $parts == 0 ? $whole : $fraction}] \
          [expr {$least * (1 + $relatively_close) + $close}]]
        if {$error eq ""} continue
        lappend candidates [list $error $count $d [expr {$count / $square}]]
        if {$error < $least} {
          set least $error
        }
      }
    }
    lappend done [expr {[lindex $spans end 0] / $square}] $least
    {*}$tick
  }
  return [lsort -real -index 0 $candidates]
}

# The worst error of the outputs behind a VCO, each with its nearest divider, as a fraction; ""
# when it is larger than `most` or an output cannot be in its range. An outline has for each output
# what grid_dividers.tcl tells.
proc ::vorkel::grid_loops::Error {vco outline most} {
  set worst 0.0
  foreach {per_frequency per_highest per_lowest end below above} $outline {
    set quotient [expr {$vco * $per_frequency}]
    set first [expr {int(ceil(min($vco * $per_highest, $end + 1)))}]
    set last [expr {int(min($vco * $per_lowest, $end))}]
    set near [expr {int(min($quotient, $end))}]
    set low [lindex $below [expr {min($near, $last)}]]
    set high [lindex $above [expr {max($near + 1, $first)}]]
    set error Inf
    if {$low >= $first && $low > 0} {
      set error [expr {abs($quotient / $low - 1.0)}]
      if {$high <= $last} {
        set error [expr {min($error, abs($quotient / $high - 1.0))}]
      }
    } elseif {$high <= $last} {
      set error [expr {abs($quotient / $high - 1.0)}]
    } else {
      return ""
    }
    if {$error > $most} {
      return ""
    }
    if {$error > $worst} {
      set worst $error
    }
  }
  return $worst
}

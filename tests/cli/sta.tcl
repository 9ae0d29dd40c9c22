# Plans in a timing engine: a netlist for each, what the engine makes of it and of the constraints,
# and how that differs from what the settings make.
#
# The engine is the opensta of Debian. It counts in floats. For the gap between two clocks it goes
# through the periods of the capturing clock until both clocks begin one at the same time, but at
# most through 1000 periods, or 100 when the capturing clock is the slower one. Then it warns that
# it has found no common period, and the gap is the least of those that it has seen. Times that
# differ by less than a millionth are the same for it, so that after many periods it takes edges
# beside each other for one, and ends too early. It does so, too, when the capturing edge is the
# fall of a clock that rises in its first period and falls in the second: it then begins a period
# before time 0, and with launches from time 0 on before the fall in that period it is content with
# them at time 0, where all clocks begin a period. By the rounding of floats, that fall may also
# come just after a launch that is at the same time. Where none of this is so, the gap must be the
# exact one. Else it must be no shorter than that, and no longer than the shortest that the engine
# must have seen.

namespace eval ::sta {
  variable folder [file join $::cli::folder sta]
  variable program [expr {[info exists ::env(VORKEL_STA)] ? $::env(VORKEL_STA) : "sta"}]
  # Periods of the capturing clock, less a few for where the counting begins.
  variable most_periods 995
  variable most_slower_periods 95
  # What the engine can tell apart, in parts of the time from 0, with room for the errors of its
  # periods; what a period and a gap may be off, in parts of themselves and of that time; and the
  # last digit of an uncertainty, ns.
  variable distinct 4e-6
  variable tolerance 6e-7
  variable rounding 1e-7
}

# A design with the primitive of a plan, and paths between all its clocks: from a flip-flop at each
# input and output to two more at each, one for the rising and one for the falling edge.
proc ::sta::netlist {module answer inputs} {
  set ports {}
  set connections {}
  for {set n 1} {$n <= $inputs} {incr n} {
    lappend ports clk_in$n
    lappend connections .CLKIN${n}(clk_in$n)
  }
  set nets $ports
  foreach output [clocked $answer] {
    lappend nets net_[pin $output]
    lappend connections .[pin $output](net_[pin $output])
  }
  set primitive [dict get $answer primitive]
  set lines [list "module $module ([join $ports {, }]);" "input [join $ports {, }];"]
  foreach net [lrange $nets $inputs end] {
    lappend lines "wire $net;"
  }
  lappend lines "$primitive [string tolower $primitive]_inst ([join $connections {, }]);"
  foreach from $nets {
    lappend lines "wire q_$from;" "FLOP_RISE launch_$from (.CK($from), .D(q_$from), .Q(q_$from));"
    foreach to $nets {
      foreach edge {RISE FALL} {
        lappend lines "FLOP_$edge [string tolower $edge]_${from}_$to (.CK($to), .D(q_$from));"
      }
    }
  }
  return [join $lines \n]\nendmodule\n
}

proc ::sta::pin {output} {
  set pin [dict get $output pin]
  return [expr {$pin eq "null" ? "CLKOUT[dict get $output index]" : $pin}]
}

# The outputs that have a clock: of those at the same pin, the first.
proc ::sta::clocked {answer} {
  set pins {}
  return [lmap output [dict get $answer outputs] {
    set pin [pin $output]
    if {$pin in $pins} continue
    lappend pins $pin
    set output
  }]
}

# Runs the engine on plans. Each is a dict with the answer (as in JSON), the inputs (ratios, MHz)
# and sdc, the constraints. Answers a list with a dict for each plan: faults (what the engine says
# of the constraints), warnings (what it says afterwards), clocks and paths as in report.tcl.
proc ::sta::run {plans} {
  variable folder
  variable program
  file copy -force [file join $folder cells.lib] $::cli::scratch
  set n 0
  foreach plan $plans {
    ::cli::write plan-$n.v [netlist plan_$n [dict get $plan answer] \
      [llength [dict get $plan inputs]]]
    ::cli::write plan-$n.sdc [dict get $plan sdc]
    incr n
  }
  set here [pwd]
  cd $::cli::scratch
  try {
    # Both the program and its script write to the file of its warnings.
    exec $program -exit -no_splash [file join $folder report.tcl] \
      >said 2>>warnings </dev/null
    set said [string trim [::cli::contents said]]
    if {$said ne ""} {
      error "the timing engine: $said"
    }
    set results {}
    foreach line [split [string trim [::cli::contents report] \n] \n] {
      lassign $line number faults clocks paths holds
      dict set results $number [dict create faults $faults warnings {} \
        clocks $clocks paths $paths holds $holds]
    }
    foreach line [split [string trim [::cli::contents warnings]] \n] {
      if {![regexp {^plan (\d+)$} $line -> number]} {
        dict with results $number {
          lappend warnings $line
        }
      }
    }
  } finally {
    cd $here
  }
  if {[dict size $results] != [llength $plans]} {
    error "the timing engine has [dict size $results] of [llength $plans] plans"
  }
  return [dict values $results]
}

# What differs between a plan and what the engine makes of it, as sentences. Beside what `run` needs,
# a plan has relations (as in JSON), whose inputs are slower by the ratio scale, and form: "" for the
# usual constraints, "fifos" where all data that needs a FIFO has one, "all" for these with the
# commands that usually are comments, and "plain" for create_clock alone. Counts the pairs of clocks
# whose gap must be exact, and the others, in the variables of that name.
proc ::sta::differences {plan result exactPairs otherPairs} {
  upvar 1 $exactPairs exact_pairs $otherPairs other_pairs
  set answer [dict get $plan answer]
  set inputs [dict get $plan inputs]
  set outputs [clocked $answer]
  set faults {}
  if {[dict get $result faults] ne ""} {
    lappend faults [dict get $result faults]
  }
  foreach output $outputs {
    lassign [::exact::shape $answer $output] frequency
    if {$frequency ne [list [dict get $output multiply] [dict get $output divide]]} {
      lappend faults "output [dict get $output index] is $frequency of the input"
    }
  }
  lassign [::exact::clocks $answer $inputs $outputs] steps clocks
  if {[dict get $plan form] eq "plain"} {
    set clocks [PlainClocks $clocks $inputs]
  }
  lappend faults {*}[ClockDifferences $steps $clocks [dict get $result clocks]]

  # Steps in a nanosecond for the inputs of the relations.
  set meant [::exact::over [list $steps 1] [dict get $plan scale]]

  set slacks [Slacks [dict get $result paths]]
  set holds [Slacks [dict get $result holds]]
  # Pairs of clocks for which it may have found no common period.
  set long {}
  foreach from [dict keys $clocks] {
    foreach to [dict keys $clocks] {
      set relation [Relation $plan $from $to]
      if {[AreApart $plan $from $to $relation]} {
        if {[dict exists $slacks $from $to] || [dict exists $holds $from $to]} {
          lappend faults "$from to $to: only one of them is there"
        }
        continue
      }
      if {[IsRelaxed $plan $relation] && [HasBothMulticycles $plan]} {
        dict unset slacks $from $to
        continue
      }
      set uncertainty [Uncertainty $plan $from $to]
      foreach edge {rise fall} {
        if {![dict exists $slacks $from $to $edge]} {
          lappend faults "$from to $to, $edge: no path"
          continue
        }
        set gap [expr {[dict get $slacks $from $to $edge] + $uncertainty}]
        lassign [Bounds $steps [dict get $clocks $from] [dict get $clocks $to] $edge] least most \
          margin isLong exact
        lappend faults {*}[RelationDifferences $relation $meant [dict get $clocks $from] \
          [dict get $clocks $to] $edge $exact]
        set shorter [expr {min([lindex [dict get $clocks $from] 0],
          [lindex [dict get $clocks $to] 0]) / double($steps)}]
        if {[HasFifo $plan $relation]} {
          set least $shorter
          set most $least
        } elseif {[IsRelaxed $plan $relation]} {
          set least [expr {$least + $shorter}]
          set most [expr {$most eq "" ? "" : $most + $shorter}]
        }
        if {$gap < $least - $margin || ($most ne "" && $gap > $most + $margin)} {
          lappend faults "$from to $to, $edge: $gap ns, not $least to $most"
        }
        incr [expr {$least eq $most ? "exact_pairs" : "other_pairs"}]
        if {$isLong} {
          lappend long [lsort [list $from $to]]
        }
      }
      if {[HasFifo $plan $relation]} {
        if {[dict exists $holds $from $to]} {
          lappend faults "$from to $to: hold is checked"
        }
      } elseif {![dict exists $holds $from $to rise]} {
        lappend faults "$from to $to: no hold is checked"
      } elseif {$least eq $most && !$isLong} {
        set hold [expr {[IsRelaxed $plan $relation] ?
          -[dict get $relation gap] * [lindex [dict get $plan scale] 1] /
            [lindex [dict get $plan scale] 0] :
          [HoldSteps [dict get $clocks $from] [dict get $clocks $to]] / double($steps)}]
        set found [expr {[dict get $holds $from $to rise] + $uncertainty}]
        if {abs($found - $hold) > $margin} {
          lappend faults "$from to $to: a hold of $found ns, not $hold"
        }
      }
      if {[dict exists $slacks $from]} {
        dict unset slacks $from $to
      }
    }
  }
  foreach from [dict keys $slacks] {
    if {[dict size [dict get $slacks $from]] > 0} {
      lappend faults "further paths: $from [dict get $slacks $from]"
    }
  }
  foreach warning [dict get $result warnings] {
    if {![regexp {^Warning: No common period was found between clocks (\S+) and (\S+)\.$} $warning \
        -> one two] || [lsort [list $one $two]] ni $long} {
      lappend faults $warning
    }
  }
  return $faults
}

# The least slacks of paths, ns: a dict from launching clock, capturing clock and edge.
proc ::sta::Slacks {paths} {
  set slacks [dict create]
  foreach path $paths {
    lassign $path from to endpoint slack
    set edge [expr {[string match fall_* $endpoint] ? "fall" : "rise"}]
    set slack [expr {$slack * 1e9}]
    if {![dict exists $slacks $from $to $edge] || $slack < [dict get $slacks $from $to $edge]} {
      dict set slacks $from $to $edge $slack
    }
  }
  return $slacks
}

# The clocks that the plain form has: of two inputs the outputs are as with the faster one.
proc ::sta::PlainClocks {clocks inputs} {
  if {[llength $inputs] == 1} {
    return $clocks
  }
  lassign $inputs one two
  set fastest [expr {[lindex $two 0] * [lindex $one 1] > [lindex $one 0] * [lindex $two 1] ? 2 : 1}]
  set plain [dict create]
  dict for {name times} $clocks {
    if {[regexp {^(clk_out\d+)_in(\d)$} $name -> output input]} {
      if {$input != $fastest} continue
      set name $output
    }
    dict set plain $name $times
  }
  return $plain
}

# What the program says of two clocks, "" for nothing.
proc ::sta::Relation {plan from to} {
  if {[dict get $plan form] ne "plain"} {
    foreach relation [dict get $plan relations] {
      if {[dict get $relation from] eq $from && [dict get $relation to] eq $to} {
        return $relation
      }
    }
  }
  return ""
}

# Whether there is a crossing that is said to go through a FIFO.
proc ::sta::HasFifo {plan relation} {
  return [expr {[dict get $plan form] in {fifos all} && $relation ne "" &&
    [dict get $relation crossing] eq "fifo"}]
}

# Whether data has a period of the faster clock more. The hold check is then at the near edge.
proc ::sta::IsRelaxed {plan relation} {
  return [expr {[dict get $plan form] eq "all" && $relation ne "" &&
    [dict get $relation crossing] eq "relaxed"}]
}

# Whether there are multicycles in periods of the launching clock and such in those of the capturing
# one. The engine puts two with the same number into one, and then counts both in the same periods.
proc ::sta::HasBothMulticycles {plan} {
  set sdc [dict get $plan sdc]
  return [expr {[string first "\nset_multicycle_path 2 -setup -start" $sdc] >= 0 &&
    [string first "\nset_multicycle_path 2 -setup -end" $sdc] >= 0}]
}

# Whether no path between two clocks is timed: they follow different inputs of the primitive, or
# have been said to be asynchronous.
proc ::sta::AreApart {plan from to relation} {
  return [expr {[AreExclusive $from $to] || ([dict get $plan form] in {fifos all} && $relation ne "" &&
    ![dict get $relation synchronous])}]
}

# An exact number of JSON as a ratio.
proc ::sta::Ratio {text} {
  lassign [split $text /] a b
  return [list $a [expr {$b eq "" ? 1 : $b}]]
}

# What of a relation is not so. `exact` is the gap to an edge, in steps, of which a nanosecond has the
# ratio `steps`.
proc ::sta::RelationDifferences {relation steps from to edge exact} {
  if {$relation eq "" || ![dict get $relation synchronous]} {
    return {}
  }
  set name "[dict get $relation from] to [dict get $relation to]"
  set gap [dict get $relation [expr {$edge eq "rise" ? "gap_exact" : "gap_rise_fall_exact"}]]
  set faults {}
  set right [::exact::over [list $exact 1] $steps]
  if {[Ratio $gap] ne $right} {
    lappend faults "$name, $edge: the relation has $gap ns, not $right"
  }
  set launches [dict get $relation launches]
  set captures [dict get $relation captures]
  set all [expr {$launches * [lindex $from 0]}]
  if {$all != $captures * [lindex $to 0] || [::exact::gcd $launches $captures] != 1 ||
      [Ratio [dict get $relation hyperperiod_exact]] ne [::exact::over [list $all 1] $steps]} {
    lappend faults "$name: $launches and $captures edges in [dict get $relation hyperperiod] ns"
  }
  if {[Ratio [dict get $relation hold_exact]] ne
      [::exact::over [list [HoldSteps $from $to] 1] $steps]} {
    lappend faults "$name: the relation has a hold of [dict get $relation hold_exact] ns"
  }
  return $faults
}

# The least time by which a rise of the second clock is before one of the first, or at the same
# time: of as many rises of the first as there are until both come again.
proc ::sta::HoldSteps {from to} {
  lassign $from first rise
  lassign $to second toRise
  set least $second
  set count [expr {$second / [::exact::gcd $first $second]}]
  for {set k 0} {$k < $count} {incr k} {
    set least [expr {min($least, ($rise + $k * $first - $toRise) % $second)}]
  }
  return $least
}

# What differs between clocks on a grid of steps and those of the engine.
proc ::sta::ClockDifferences {steps clocks found} {
  variable tolerance
  if {[lsort [dict keys $clocks]] ne [lsort [dict keys $found]]} {
    return [list "the clocks are [lsort [dict keys $found]]"]
  }
  set faults {}
  dict for {name times} $clocks {
    set period [expr {[lindex $times 0] / double($steps)}]
    foreach what {period rise fall} exact $times seconds [dict get $found $name] {
      set exact [expr {$exact / double($steps)}]
      set time [expr {$seconds * 1e9}]
      set off [expr {($time - $exact) / $period}]
      # An edge can be told in another period.
      if {$what ne "period"} {
        set off [expr {$off - round($off)}]
      }
      if {abs($off) > $tolerance} {
        lappend faults "$name: $what $time ns, not $exact"
      }
    }
  }
  return $faults
}

# How much nearer the edges of two clocks can be than their times say, ns: half of the jitter of the
# capturing clock where that is known. Of input and output, and of two pins of a KRU, both count; and
# of the former the phase error, too. All of it is known for the first input only.
proc ::sta::Uncertainty {plan from to} {
  if {[dict get $plan form] eq "plain"} {
    return 0.0
  }
  set answer [dict get $plan answer]
  set own [Jitter $answer $to]
  set other [Jitter $answer $from]
  set is_loop [expr {[dict get $answer primitive] in {PLL TSYN}}]
  set has_input [expr {[string match clk_in* $from] || [string match clk_in* $to]}]
  if {$from ne $to && $own ne "" && $other ne "" && ![regexp {in2$} "$from $to"] &&
      ![regexp {in2 } "$from $to"] && ($has_input || !$is_loop)} {
    set phase [dict get $answer phase_error]
    if {!$has_input} {
      return [expr {($own + $other) / 2000.0}]
    }
    if {$phase ne "null"} {
      return [expr {($own + $other) / 2000.0 + $phase / 1000.0}]
    }
  }
  return [expr {$own eq "" ? 0.0 : $own / 2000.0}]
}

# The jitter of a clock, ps, "" where it is not known.
proc ::sta::Jitter {answer name} {
  if {[string match clk_in* $name]} {
    return [dict get $answer input_jitter]
  }
  regexp {^clk_out(\d+)(?:_in(\d))?$} $name -> index input
  set jitter [dict get [lindex [dict get $answer outputs] $index] jitter]
  return [expr {$input eq "2" || $jitter eq "null" ? "" : $jitter}]
}

# Whether two clocks follow different inputs of the primitive.
proc ::sta::AreExclusive {one two} {
  return [expr {[regexp {^clk_out\d+_in(\d)$} $one -> first] &&
    [regexp {^clk_out\d+_in(\d)$} $two -> second] && $first != $second}]
}

# What the engine's gap between two clocks must be: at least and at most (ns, "" when it can be
# anything), how far it may be off, whether it may have found no common period, and what the gap is,
# in steps. Clocks are period, rise and fall in steps, of which a nanosecond has `steps`.
proc ::sta::Bounds {steps from to edge} {
  variable most_periods
  variable most_slower_periods
  variable distinct
  variable tolerance
  variable rounding
  lassign $from first rise
  lassign $to second toRise toFall
  set capture [expr {$edge eq "fall" ? $toFall : $toRise}]
  # Periods of the capturing clock until both begin one at the same time.
  set periods [expr {$first / [::exact::gcd $first $second]}]
  set limit [expr {$second > $first ? $most_slower_periods : $most_periods}]
  # The least difference between edges that are not at the same time, and with it the periods in
  # which the engine can tell all of them apart.
  set grain [::exact::gcd [::exact::gcd $first $second] [expr {$capture - $rise}]]
  set seen [expr {min($periods, $limit, int($grain / ($distinct * $second)))}]
  set least [::exact::gap $first $rise $second $capture $periods 0]
  set exact $least
  set most $least
  if {$seen < $periods} {
    set most [::exact::gap $first $rise $second $capture $seen 1]
  }
  if {$capture >= $second} {
    # A fall in the second period.
    set before [::exact::gap $first $rise $second [expr {$capture - $second}] 1 1]
    if {$before ne ""} {
      set most $before
    }
    set apart [expr {$capture - $second - $rise}]
    if {$apart >= 0 && $apart % $first == 0} {
      set least 0
    }
  }
  set time [expr {($seen * $second + $first + $second) / double($steps)}]
  return [list [expr {$least / double($steps)}] \
    [expr {$most eq "" ? "" : $most / double($steps)}] \
    [expr {$tolerance * $time + $rounding}] [expr {$periods > $limit}] $exact]
}

# Run by the timing engine in a folder with a netlist plan-N.v of a module plan_N and constraints
# plan-N.sdc for each plan: writes what the engine makes of them to the file "report", and a line
# with the number of a plan to standard error before it says anything about it.
#
# A line of the report is a list: the number of the plan, what is wrong with its constraints, the
# clocks (a dict from name to period, rise and fall, in seconds), and the paths of setup and those of
# hold (lists of the launching clock, the capturing clock, the endpoint and the slack, in seconds).

# The paths of setup (max) or of hold (min).
proc paths {delay} {
  set paths {}
  foreach end [find_timing_paths -path_delay $delay -group_count 100000 -endpoint_count 100] {
    lappend paths [list [get_property [get_property $end startpoint_clock] name] \
      [get_property [$end target_clk] name] \
      [get_property [get_property $end endpoint] full_name] [$end slack]]
  }
  return $paths
}

set report [open report w]
# In this interpreter stderr is the engine's standard output.
set marks [open /dev/stderr a]
fconfigure $marks -buffering line

read_liberty cells.lib
for {set n 0} {[file exists plan-$n.v]} {incr n} {
  puts $marks "plan $n"
  # A new design has no constraints of that before.
  read_verilog plan-$n.v
  link_design plan_$n
  # Errors are only printed, too. That a flip-flop has several clocks, one from each input, is as it
  # should be.
  with_output_to_variable faults "
    read_sdc plan-$n.sdc
    check_setup -no_clock -unconstrained_endpoints -loops -generated_clocks
  "
  ::sta::update_generated_clks
  set clocks {}
  foreach clock [all_clocks] {
    lappend clocks [get_property $clock name] [list [$clock period] {*}[$clock waveform]]
  }
  puts $report [list $n [string map {\n { }} [string trim $faults]] $clocks [paths max] [paths min]]
}
close $report

# Plans in the tools that simulate and read them: iverilog, verilator, ghdl and yosys.

source [file join [file dirname [info script]] .. cli support.tcl]
source [file join [file dirname [info script]] .. cli exact_clocks.tcl]
source [file join [file dirname [info script]] .. cli drawn_plans.tcl]
unset -nocomplain env(VORKEL_PROGRAM) env(VORKEL_DEVICES)

namespace eval ::hdl {
  variable folder [file dirname [file normalize [info script]]]
  variable verilog [file join $::cli::checkout hdl verilog]
  variable vhdl [file join $::cli::checkout hdl vhdl]
  # The models in VHDL, in the order of their analysis.
  variable units {
    vorkel_model vorkel_model_input vorkel_model_output vorkel_model_limit vorkel_model_feedback
    vorkel_model_loop vorkel_clock_source vorkel_clock_check vorkel_pll vorkel_tsyn vorkel_kru_sp
    vorkel_kru_clkgen
  }
}

# Runs a tool in the scratch folder; a dict as that of ::cli::execute.
proc ::hdl::tool {args} {
  set here [pwd]
  cd $::cli::scratch
  try {
    return [::cli::execute {*}$args]
  } finally {
    cd $here
  }
}

# Runs one that must succeed and say nothing at all.
proc ::hdl::silent {args} {
  set result [tool {*}$args]
  if {$result ne {status 0 out {} err {}}} {
    error "[lindex $args 0]: $result"
  }
}

# What simulators say, in one text, and whether they have ended well.
proc ::hdl::said {result} {
  return [list [expr {[dict get $result status] == 0}] \
    [string trim [dict get $result out]\n[dict get $result err]]]
}

# Compiles and runs a testbench in Verilog: files beside the models, and options of iverilog.
proc ::hdl::icarus {top files args} {
  variable verilog
  silent iverilog -g2012 -Wall -y $verilog -s $top -o $top.vvp {*}$args {*}$files
  return [said [tool vvp -n $top.vvp]]
}

# Prepares the models for ghdl, in a library for each standard.
proc ::hdl::prepareGhdl {{standards {93 08}}} {
  variable vhdl
  variable units
  foreach standard $standards {
    file mkdir [file join $::cli::scratch ghdl-$standard]
    foreach unit $units {
      silent ghdl -a --std=$standard --workdir=ghdl-$standard [file join $vhdl $unit.vhd]
    }
  }
}

proc ::hdl::ghdl {standard top files args} {
  set options [list --std=$standard --workdir=ghdl-$standard]
  foreach file $files {
    silent ghdl -a {*}$options $file
  }
  return [said [tool ghdl --elab-run {*}$options $top {*}$args]]
}

# Writes module and testbench of a plan in a language, as NAME.v and NAME_tb.v; the names of the
# files.
proc ::hdl::write {language name words} {
  set suffix [expr {$language eq "vhdl" ? "vhd" : "v"}]
  set files {}
  foreach {ending options} [list {} [list --format $language] \
    _tb [list --format testbench --language $language]] {
    set file [file join $::cli::scratch $name$ending.$suffix]
    set result [::cli::vorkel {*}$words --name $name {*}$options -o $file]
    if {[dict get $result status] ni {0 3} || [dict get $result err] ne ""} {
      error "$words: $result"
    }
    lappend files $name$ending.$suffix
  }
  return $files
}

# A file of the scratch folder with some of its text replaced, which must be there once.
proc ::hdl::replace {file from to} {
  set text [::cli::contents [file join $::cli::scratch $file]]
  if {[llength [regexp -all -inline -- "***=$from" $text]] != 1} {
    error "$file does not have \"$from\" once"
  }
  ::cli::write $file [string map [list $from $to] $text]
}

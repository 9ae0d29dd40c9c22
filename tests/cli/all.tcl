# Runs every test file of this folder, each in a process of its own. Exits with 1 when one of
# them fails.

set folder [file dirname [file normalize [info script]]]
set runner [file join [file dirname $folder] support run_tcl_test.tcl]
set failed {}
foreach file [lsort [glob -directory $folder *.test]] {
  if {[catch {exec [info nameofexecutable] $runner $file >@stdout 2>@stderr}]} {
    lappend failed [file tail $file]
  }
}
if {[llength $failed] > 0} {
  puts stderr "failed: [join $failed {, }]"
  exit 1
}

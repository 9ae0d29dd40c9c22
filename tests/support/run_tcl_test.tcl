# Runs one tcltest file and exits with 1 when a test of it fails or when it runs none.
#
# Usage: tclsh run_tcl_test.tcl FILE ?tcltest option ...?
#
# With VORKEL_PRELOAD in the environment the file runs in a tclsh that has those libraries
# loaded first (the run-time libraries of sanitizers).
if {[info exists env(VORKEL_PRELOAD)] && ![info exists env(LD_PRELOAD)]} {
    set env(LD_PRELOAD) $env(VORKEL_PRELOAD)
    if {[catch {exec [info nameofexecutable] [info script] {*}$argv >@ stdout 2>@ stderr}]} {
        exit 1
    }
    exit 0
}

package require tcltest 2.5
set file [lindex $argv 0]
tcltest::configure -verbose {body error start} -singleproc 1 {*}[lrange $argv 1 end]

# cleanupTests of the file prints the summary and resets the counts, so they are taken before.
set ::vorkelFailed 0
set ::vorkelRun 0
proc tcltest::cleanupTestsHook {} {
    set ::vorkelFailed $::tcltest::numTests(Failed)
    set ::vorkelRun [expr {$::tcltest::numTests(Passed) + $::tcltest::numTests(Failed)}]
}

# A file that ends with an error of its own has failed, too.
if {[catch {source $file} message options]} {
    puts stderr [dict get $options -errorinfo]
    exit 1
}
exit [expr {$vorkelFailed > 0 || $vorkelRun == 0}]

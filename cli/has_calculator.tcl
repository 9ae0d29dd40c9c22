# Prints 1 when the part that is named has a calculator of jitter and phase error, else 0.
#
# The only way to learn that is to ask a question. Without a calculator the engine complains on
# the standard error of the process, where no script can keep it from appearing. So the program
# has this script ask, as a process of its own with no standard error to speak of.

source -encoding utf-8 [file join [file dirname [info script]] lib engine.tcl]
::vorkel::engine::load
set handle [Ip::Vorkel::Init]
$handle SetDevice [lindex $argv 0]
# A calculator answers with a figure or says why not; where there is none, the answer is empty.
catch {$handle GetKRUPhaseError} answer
puts [expr {$answer ne ""}]

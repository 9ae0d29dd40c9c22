# What the files of tests/model/ that were found share: they replay lines of a script and hold each
# against the answer that it should have.

source [file join $::env(VORKEL_SOURCE_DIR) tests/package/support.tcl]
namespace import -force ::tcltest::cleanupTests

# A device with a text of its own for its file.
proc device {name text} {
    writeFile [file join $::deviceFolder $name.toml] $text
}

# A process that carries out the lines and tells of each: its status and its result, or "*" where that
# is not told. What a line traces comes before that.
set replayer {
    lappend auto_path [lindex $argv 0]
    package require Ip_vorkel
    foreach {line told} [lindex $argv 1] {
        set status [catch $line result]
        regsub -all {::Script::handle[0-9]+} $result HANDLE result
        puts "= $status [if {$told} {set result} else {string cat *}]"
    }
}

# Lines of a script: of each its text, its status, its result ("*": any) and its trace. Empty, or the
# first difference.
proc replay {lines} {
    set expected ""
    set script {}
    foreach {text status result trace} $lines {
        append expected $trace "= $status $result\n"
        lappend script $text [expr {$result ne "*"}]
    }
    set file [file join [newFolder] replay.tcl]
    writeFile $file $::replayer
    set given [exec [info nameofexecutable] $file $::packageDir $script 2>/dev/null]\n
    foreach is [split $given \n] should [split $expected \n] {
        if {$is ne $should} {
            return "\"$is\", not \"$should\""
        }
    }
}

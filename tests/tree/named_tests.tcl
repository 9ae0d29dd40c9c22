# Refuses names of tests in sources that the tree does not have: "Tested by X_test.cpp." is how to find
# the test of a source, and a promise that there is one.
#
#   tclsh8.6 named_tests.tcl ROOT FOLDER...
#
# Looks at each sentence of the sources in the folders that begins with "Tested by". A name with a folder
# counts from the root; one without is a file anywhere in tests/. Prints each name that is wrong, and
# ends with status 1 when there is one.

# The files below a folder of the root whose names match one of some patterns.
proc files {root folder patterns} {
  set files {}
  foreach file [glob -nocomplain -directory $root -tails -types f -- {*}[lmap pattern $patterns {
    file join $folder $pattern
  }]] {
    lappend files $file
  }
  foreach inner [glob -nocomplain -directory $root -tails -types d -- $folder/*] {
    lappend files {*}[files $root $inner $patterns]
  }
  return $files
}

# The names of files and folders in the sentences of a text that begin with "Tested by".
proc tests {text} {
  # Comments that go over several lines in one.
  regsub -all {\n *(//|#) *} $text { } text
  set names {}
  foreach {match sentence} [regexp -all -inline {Tested by (.*?)(?:\.\s|\.$|\n)} $text] {
    lappend names {*}[regexp -all -inline {\w+(?:[./]\w+)+} $sentence]
  }
  return $names
}

set folders [lassign $argv root]
foreach file [files $root tests *] {
  set have([file tail $file]) 1
}
set count 0
set wrong 0
foreach folder $folders {
  foreach file [files $root $folder {*.h *.cpp *.tcl *.py}] {
    set channel [open [file join $root $file]]
    set text [read $channel]
    close $channel
    foreach name [tests $text] {
      incr count
      if {[info exists have($name)] ||
          ([string match */* $name] && [file exists [file join $root $name]])} {
        continue
      }
      puts "$file: there is no $name"
      set wrong 1
    }
  }
}
if {$count == 0} {
  puts "no test is named"
  set wrong 1
}
exit $wrong

# Refuses circles of includes between the folders of the C++ sources, and an include of one folder
# by another that stands below it. A folder is what a namespace is; it may use what its
# libraries have, and nothing that uses it.
#
#   tclsh8.6 circles.tcl ROOT FOLDER...
#
# Prints each circle as the folders that it goes through, and ends with status 1 when there is one.

# A dict from each folder below some to the folders whose headers its sources include.
proc uses {root folders} {
  set uses [dict create]
  foreach file [sources $root $folders] {
    set folder [file dirname $file]
    if {![dict exists $uses $folder]} {
      dict set uses $folder {}
    }
    set channel [open [file join $root $file]]
    foreach {line name} [regexp -all -inline -line {^#include "([^"]+)"} [read $channel]] {
      set other [file dirname $name]
      if {$other ne $folder && $other ni [dict get $uses $folder] &&
          [file isfile [file join $root $name]]} {
        dict lappend uses $folder $other
      }
    }
    close $channel
  }
  return $uses
}

proc sources {root folders} {
  set files {}
  foreach folder $folders {
    foreach file [glob -nocomplain -directory $root -tails -- $folder/*.h $folder/*.cpp] {
      lappend files $file
    }
    foreach inner [glob -nocomplain -directory $root -tails -types d -- $folder/*] {
      lappend files {*}[sources $root [list $inner]]
    }
  }
  return $files
}

# The first circle from a folder on along the path to it, or "".
proc circle {uses folder path} {
  variable done
  if {$folder in $path} {
    return [list {*}[lrange $path [lsearch -exact $path $folder] end] $folder]
  }
  if {[info exists done($folder)] || ![dict exists $uses $folder]} {
    return ""
  }
  foreach other [dict get $uses $folder] {
    set found [circle $uses $other [list {*}$path $folder]]
    if {$found ne ""} {
      return $found
    }
  }
  set done($folder) 1
  return ""
}

set folders [lassign $argv root]
set uses [uses $root $folders]
set status 0
foreach folder [dict keys $uses] {
  set found [circle $uses $folder {}]
  if {$found ne ""} {
    puts "a circle of includes: [join $found { -> }]"
    set status 1
    break
  }
}
if {[dict size $uses] == 0} {
  puts "no sources in $root"
  set status 1
}
exit $status

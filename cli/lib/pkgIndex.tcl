# Every file of this folder is a package of its name.
apply {dir {
  foreach file [glob -directory $dir *.tcl] {
    set name [file rootname [file tail $file]]
    if {$name ne "pkgIndex"} {
      package ifneeded vorkel::$name 1.1 [list source -encoding utf-8 $file]
    }
  }
}} $dir

apply {dir {
  foreach name {
    catalogue devices engine help main notes numbers options report request synthesis table
  } {
    package ifneeded vorkel::$name 1.1 [list source -encoding utf-8 [file join $dir $name.tcl]]
  }
}} $dir

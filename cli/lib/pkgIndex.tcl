apply {dir {
  foreach name {
    catalogue devices engine help kru_notes kru_report main notes numbers options report request
    synthesis table timing
  } {
    package ifneeded vorkel::$name 1.1 [list source -encoding utf-8 [file join $dir $name.tcl]]
  }
}} $dir

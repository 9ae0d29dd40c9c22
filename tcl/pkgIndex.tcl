package ifneeded vorkel 1.1 [list load [file join $dir libvorkel.so] Vorkel]

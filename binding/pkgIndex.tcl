package ifneeded Ip_vorkel 1.1 [list load [file join $dir libIp_Vorkel.so]]

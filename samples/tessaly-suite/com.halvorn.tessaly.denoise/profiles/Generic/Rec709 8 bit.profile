camera=generic
iso=0
unit=display
0.0000 0.0118
0.5000 0.0140
1.0000 0.0092

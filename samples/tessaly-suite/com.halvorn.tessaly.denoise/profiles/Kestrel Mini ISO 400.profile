camera=Kestrel Mini
iso=400
unit=linear
0.0010 0.0035
0.0100 0.0061
0.1000 0.0139
1.0000 0.0416

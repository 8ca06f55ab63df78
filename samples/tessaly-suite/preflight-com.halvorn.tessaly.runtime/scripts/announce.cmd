echo Tessaly Suite 4.2.0: the run begins with the runtime

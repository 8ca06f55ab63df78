/* The smallest program there is: the tests want its version block, nobody runs it. */
int Start(void) { return 0; }

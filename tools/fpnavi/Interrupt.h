// Ctrl-C and other requests to end, for commands that have something to put in order first.
#ifndef FPNAVI_TOOLS_INTERRUPT_H
#define FPNAVI_TOOLS_INTERRUPT_H

namespace command {

// From now on SIGINT, SIGTERM and SIGHUP are noted, unless they were ignored; a second one ends the
// program at once.
void CatchInterrupts();

// The signal that came; 0: none.
int InterruptingSignal();

// Ends the program by the signal that came, as whoever started it expects. Returns when none came.
void EndByInterrupt();

}  // namespace command

#endif  // FPNAVI_TOOLS_INTERRUPT_H

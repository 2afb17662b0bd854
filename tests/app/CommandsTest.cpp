#include "e2e/Transcript.h"

// The pelmo program's commands, run as a user runs them.
PELMO_SESSIONS(Commands, "commands.txt");

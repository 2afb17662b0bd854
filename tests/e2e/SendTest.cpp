#include "Transcript.h"

// pelmo send as a user runs it, against aiosmtpd and servers that misbehave on purpose.
PELMO_SESSIONS(Send, "send.txt");

#pragma once

// Ends the process with this code when it has not ended by itself soon (0.7 s). Leaving in good
// order can wait for the network: a name look-up that runs cannot be called off. Whoever pressed
// Exit does not wait.
void startExitDeadline(int exitCode);

#pragma once

/// Fills each of the descriptors 0 to 2 that is closed, so that none is taken by a file or a socket
/// that is opened later and would be read from or printed into. What fills it fails when it is
/// used, as the closed one would. Ahead of everything else.
void FillClosedStreams();

/// Sees to it that what cannot be written to standard output does not pass for a success: at exit,
/// the reason is told on the error stream and the status is 1. That a reader has seen enough is no
/// news to anybody and only gives the status.
void CheckStandardOutputAtExit();

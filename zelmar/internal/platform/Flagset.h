#pragma once

/// Stand-in for the platform's flag set, which nothing here reads.
inline void Flagset_InitDeltaMode() {}

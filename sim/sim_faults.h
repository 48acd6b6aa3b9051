#pragma once
// Faults the simulator can show on demand. Frame numbers count the valid
// request frames received since the faults were set, from 1.

#include "sim/sim_models.h"

namespace kv::sim {

struct SimFaults {
    int dropEvery = 0;     // no reply to every n-th frame (0: off)
    int dropFrame = 0;     // no reply to frame k (0: off)
    int corruptEvery = 0;  // wrong check characters on every n-th reply (1: all)
    int noiseBytes = 0;    // random bytes (never STX) before every reply
    int splitBytes = 0;    // send each reply in pieces of this many bytes (0: whole)
    int splitGapMs = 15;   // pause between the pieces; over 10 ms ends the program's read
    int latencyMs = 0;     // pause before every reply
    int deadAfter = -1;    // answer only the first n frames, then nothing (-1: off)
    int swapAfter = -1;    // after frame n the module on the adapter becomes swapTo (-1: off)
    ModuleIdentity swapTo;
};

}  // namespace kv::sim

#pragma once

#include <cstdint>

// What this library relies on of the platform's closed gesture engine, libgesture.
extern "C" {

// Starts the engine; false when it did not start. What the two zeros mean is the engine's affair.
bool gesture_initial(int, int);

// Takes one group of six samples; `count` is 1; `last` marks the last group of a record. Returns null, or the name of a
// recognised gesture in memory of array new, which the caller deletes.
char* gesture_process_single_data(const int16_t* group, int count, bool last);

void gesture_close();
}

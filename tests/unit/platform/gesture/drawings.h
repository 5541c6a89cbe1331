// Drawings that people made, and movements made up, as the gesture engine takes them.
#pragma once

#include <drawing.h>

#include <vector>

using Record = std::vector<gesture::Group>;

// The drawings of a digit in data/digits, in order of time, every second sample of each.
std::vector<Record> drawingsOf(int digit);

// A movement that goes left, then right: the acceleration in x is +50, then -50 (1/1000 g), the angular rate about z is
// +100, then -100 (mrad/s), each for so many groups.
Record leftAndRight(int groupsEach);

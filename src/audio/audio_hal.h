#pragma once

// The bridge to the platform's aware audio device: see the functions of the same purpose in senseloom.h, which do
// nothing but call these. The library itself calls these alone.
namespace senseloom {

bool openAudio();
bool activateAudio();
bool deactivateAudio();

}  // namespace senseloom

#pragma once

#include <span>
#include <string>

namespace senseloom::tool {

// Throws std::runtime_error if the file cannot be written, and InputError if it is one of the files that are read, or
// a PNG and nothing is there to make one. What it holds stays in it.
void requireWritable(const std::string& file, std::span<const std::string> inputs);
// Replaces what the file holds by a picture, given as SVG. If the name ends with ".png", it is drawn with the program
// rsvg-convert. Throws std::runtime_error if the file cannot be written.
void writePicture(const std::string& file, const std::string& svg);

}  // namespace senseloom::tool

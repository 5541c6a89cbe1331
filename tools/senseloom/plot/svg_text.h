#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace senseloom::tool {

// Text as it may stand in XML. Characters that XML cannot hold become question marks.
std::string xmlText(std::string_view text);

// The first characters of a UTF-8 text, with dots in place of those left out.
std::string shortened(std::string_view text, size_t most);

// Names as they fit before a lane. Those that are too long lose their middle, and stay different from each other.
std::vector<std::string> shortenedApart(const std::vector<std::string>& names);

// A coordinate with one decimal at most.
std::string coordinate(double value);

// An integer with a comma before each three digits.
std::string grouped(uint64_t number);

// The distance of the marks on an axis: the least of 1, 2 and 5 times a power of ten that has at most `most` multiples
// in the span.
double axisStep(double span, int most);

}  // namespace senseloom::tool

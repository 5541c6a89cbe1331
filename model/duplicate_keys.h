#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace senseloom::model {

// The keys that a JSON object has more than once, each named once. The text is JSON; of what is not an object there are
// none.
std::vector<std::string> keysGivenTwice(std::string_view text);

}  // namespace senseloom::model

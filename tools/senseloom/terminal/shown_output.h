#pragma once

#include <cstdio>

namespace senseloom::tool {

// Passes on what was printed so far, for a reader to see at once. When the output is a pipe that nobody reads any more,
// as after `| head`, it ends the tool as a write would: throws ExitStatus. `writesMore`: something else is written,
// too, such as a picture, so the tool goes on.
void showSoFar(std::FILE* out, bool writesMore = false);

}  // namespace senseloom::tool

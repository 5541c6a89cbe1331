#pragma once

#include <functional>
#include <memory>
#include <string>

#include "trace/byte_stream.h"

namespace senseloom::tool {

// Called when all that is there so far was read, before a wait for more. Returns whether to wait.
using BeforeWait = std::function<bool()>;

// Opens a file that another program still writes; "-" is standard input. Reading waits for more: of a pipe until its
// end, of a file as long as `beforeWait`, which is called at least ten times a second meanwhile, says so, and of both
// until the user interrupts it. A named pipe is opened without waiting for its writer. Bytes of 0, room that a
// recording has reserved in its file, are left out until something else is written there.
//
// Throws InputError, also when something compressed is read or the file becomes shorter than what was read.
std::unique_ptr<ByteStream> followBytes(const std::string& file, BeforeWait beforeWait);

}  // namespace senseloom::tool

#pragma once

// A function of ctx_dispatch_data()'s arguments that does nothing, in a shared library of its own: what any call
// through such an interface costs.
extern "C" int empty_call(void* handle, void* data, int len, void** out, int* outlen) noexcept;

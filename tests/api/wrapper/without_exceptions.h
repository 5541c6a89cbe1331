#pragma once

// A client that is compiled without exceptions and run-time type information. Sums the integer properties that the
// sensor is to run with and the bytes that the record comes to; -1 for any failure.
int sumWithoutExceptions(const char* sensor, const char* option);

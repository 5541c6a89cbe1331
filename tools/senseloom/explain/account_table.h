#pragma once

#include <cstdio>
#include <vector>

#include "explain/account.h"

namespace senseloom::tool {

// Prints a table with a row an account, and a column for each fate that any record had; then the chains. Where there
// are many accounts, those with the same row are one row, unless `all` are wanted. Nothing without records.
void printAccounts(std::FILE* out, const std::vector<Account>& accounts, bool all);

}  // namespace senseloom::tool

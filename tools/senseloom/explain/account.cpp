#include "explain/account.h"

#include <numeric>

namespace senseloom::tool {

size_t Account::records() const {
  return std::accumulate(fates.begin(), fates.end(), unexplained);
}

}  // namespace senseloom::tool

#include "dispatch.h"

#include <algorithm>
#include <numeric>
#include <random>

namespace bench {

Order openingOrder(size_t clients) {
  Order order(clients);
  std::iota(order.begin(), order.end(), size_t{0});
  return order;
}

Order shuffledOrder(size_t clients) {
  Order order = openingOrder(clients);
  std::shuffle(order.begin(), order.end(), std::mt19937(3));
  return order;
}

}  // namespace bench

#include "without_exceptions.h"

#include <senseloom.hpp>  // first of all, to show that it includes what it needs

#include <array>
#include <utility>

int sumWithoutExceptions(const char* sensor, const char* option) {
  auto opened = senseloom::Session::open(sensor);
  auto session = std::move(opened);
  if (!session) return -1;

  int sum = 0;
  const auto negotiated = session.setOption(option);
  if (!negotiated) return -1;
  for (const auto property : negotiated.properties) sum += property.asInt().value_or(0);

  constexpr std::array<uint8_t, 2> record = {20, 22};
  const auto dispatched = session.dispatch(record);
  if (dispatched.outcome != senseloom::DispatchOutcome::delivered) return -1;
  for (const auto byte : dispatched.result) sum += byte;

  return session.close().outcome == senseloom::CloseOutcome::sensorStopped ? sum : -1;
}

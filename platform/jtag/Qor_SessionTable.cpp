#include "platform/jtag/Qor_SessionTable.h"

#include <limits>
#include <stdexcept>
#include <string>
#include <utility>

namespace QorRT {

Qor_SessionTable& Qor_SessionTable::instance() {
  static Qor_SessionTable& table = *new Qor_SessionTable;
  return table;
}

unsigned Qor_SessionTable::add(std::shared_ptr<Qor_Session> session) {
  const std::lock_guard<std::mutex> guard(mutex_);
  if (nextHandle_ > std::numeric_limits<unsigned>::max())
    throw std::runtime_error("no session handle is left");
  const unsigned handle = static_cast<unsigned>(nextHandle_);
  sessions_.emplace(handle, std::move(session));
  ++nextHandle_;
  return handle;
}

std::shared_ptr<Qor_Session> Qor_SessionTable::get(unsigned session) {
  const std::lock_guard<std::mutex> guard(mutex_);
  if (const auto entry = sessions_.find(session); entry != sessions_.end()) return entry->second;
  if (session != 0 && session < nextHandle_) throwClosed(session);
  throw std::logic_error("unknown session " + std::to_string(session));
}

std::shared_ptr<Qor_Session> Qor_SessionTable::find(unsigned session) noexcept {
  const std::lock_guard<std::mutex> guard(mutex_);
  const auto entry = sessions_.find(session);
  return entry == sessions_.end() ? nullptr : entry->second;
}

void Qor_SessionTable::remove(unsigned session) noexcept {
  const std::lock_guard<std::mutex> guard(mutex_);
  sessions_.erase(session);
}

void throwClosed(unsigned session) {
  throw std::logic_error("session " + std::to_string(session) + " is closed");
}

}  // namespace QorRT

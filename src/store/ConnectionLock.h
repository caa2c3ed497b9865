#pragma once

#include <sqlite3.h>

namespace quorl::store_detail {

/// Holds a connection's own mutex, which is a recursive one: over many rows every column would enter it anew.
class ConnectionLock {
 public:
  explicit ConnectionLock(sqlite3* connection) : mutex_(sqlite3_db_mutex(connection)) { sqlite3_mutex_enter(mutex_); }
  ~ConnectionLock() { sqlite3_mutex_leave(mutex_); }
  ConnectionLock(const ConnectionLock&) = delete;
  ConnectionLock& operator=(const ConnectionLock&) = delete;

 private:
  sqlite3_mutex* const mutex_;
};

}  // namespace quorl::store_detail

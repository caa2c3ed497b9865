#pragma once

#include <memory>

struct sqlite3_stmt;

namespace quorl {

struct FinalizeStatement {
  void operator()(sqlite3_stmt* statement) const;
};
/// A prepared statement, finalised when it goes away. Its connection must still be open then.
using StatementHandle = std::unique_ptr<sqlite3_stmt, FinalizeStatement>;

}  // namespace quorl

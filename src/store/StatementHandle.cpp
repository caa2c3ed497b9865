#include "store/StatementHandle.h"

#include <sqlite3.h>

namespace quorl {

void FinalizeStatement::operator()(sqlite3_stmt* statement) const {
  sqlite3_finalize(statement);
}

}  // namespace quorl

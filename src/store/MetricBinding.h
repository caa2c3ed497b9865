#pragma once

#include <string>

#include "store/Metric.h"

struct sqlite3_stmt;

namespace quorl {

/// Binds a row to the nine parameters of `SQLTable<Metric>::insertMetric`, in their order; `collectedOn` is its
/// wall-clock text. Texts end at their first zero byte. Nothing is copied: row and text must outlive the step. Answers
/// the first parameter that could not be bound, 0 if all are.
int bindMetric(sqlite3_stmt* statement, const Metric& metric, const std::string& collectedOn);

}  // namespace quorl

#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quorl {

/// Error of the storage layer. `message` belongs to every case but `EmptyQueryResult`.
struct SQLiteError {
  enum class Case {
    OpenDatabase,      // the file could not be opened
    Prepare,           // a statement could not be prepared; also a failed step and a failed first bind
    Step,              // exists on purpose, and nothing raises it
    Bind,              // a bind of parameters 2 to 9 of the metric insert failed
    EmptyQueryResult,  // a row came back with a NULL text column or a date that does not parse
  };

  Case kind = Case::Prepare;
  std::string message;

  friend bool operator==(const SQLiteError&, const SQLiteError&) = default;
};

/// The default description of an error value: `Prepare(message: "near \"x\": syntax error")`, `EmptyQueryResult`.
std::string logText(const SQLiteError& error);
/// The description of an optional error: `Optional(Prepare(message: "..."))`, `nil`.
std::string logText(const std::optional<SQLiteError>& error);

/// The default description of an enumeration's case that carries a text: `name(message: "...")`, with quotes,
/// backslashes and line breaks of `message` escaped.
std::string caseDescription(std::string_view name, std::string_view message);

}  // namespace quorl

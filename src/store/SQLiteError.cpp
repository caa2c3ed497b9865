#include "store/SQLiteError.h"

#include "base/FatalStop.h"

namespace quorl {
namespace {

std::string_view caseName(SQLiteError::Case kind) {
  switch (kind) {
    case SQLiteError::Case::OpenDatabase:
      return "OpenDatabase";
    case SQLiteError::Case::Prepare:
      return "Prepare";
    case SQLiteError::Case::Step:
      return "Step";
    case SQLiteError::Case::Bind:
      return "Bind";
    case SQLiteError::Case::EmptyQueryResult:
      return "EmptyQueryResult";
  }
  fatalStop("SQLiteError: no such case");
}

}  // namespace

std::string caseDescription(std::string_view name, std::string_view message) {
  std::string text(name);
  text += "(message: \"";
  for (const char character : message) {
    switch (character) {
      case '"':
      case '\\':
        text += '\\';
        text += character;
        break;
      case '\n':
        text += "\\n";
        break;
      case '\r':
        text += "\\r";
        break;
      case '\t':
        text += "\\t";
        break;
      default:
        text += character;
    }
  }
  text += "\")";
  return text;
}

std::string logText(const SQLiteError& error) {
  const std::string_view name = caseName(error.kind);
  if (error.kind == SQLiteError::Case::EmptyQueryResult) return std::string(name);
  return caseDescription(name, error.message);
}

std::string logText(const std::optional<SQLiteError>& error) {
  return error ? "Optional(" + logText(*error) + ")" : "nil";
}

}  // namespace quorl

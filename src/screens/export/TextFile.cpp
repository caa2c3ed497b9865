#include "screens/export/TextFile.h"

#include <cerrno>
#include <string_view>
#include <system_error>

#include "base/PartFile.h"

namespace quorl {
namespace {

TextFileError systemError(int code) {
  return {code == EEXIST ? TextFileError::Kind::exists : TextFileError::Kind::notWritten,
          std::generic_category().message(code)};
}

}  // namespace

tl::expected<std::uintmax_t, TextFileError> writeTextFile(const std::filesystem::path& path, const SharedText& text,
                                                          Overwrite overwrite) {
  std::error_code ignored;
  const std::filesystem::file_status status = std::filesystem::status(path, ignored);
  if (std::filesystem::is_directory(status)) return tl::unexpected(systemError(EISDIR));
  // Known at once in the usual case; the move at the end holds in any.
  if (overwrite == Overwrite::no && std::filesystem::exists(status)) return tl::unexpected(systemError(EEXIST));

  PartFile part(path);
  std::uintmax_t size = 0;
  if (part.error() == 0) {
    text.write([&](std::string_view piece) {
      size += piece.size();
      return part.write(piece);
    });
  }
  if (part.error() == 0) part.flush();
  if (part.error() == 0) part.moveTo(path, overwrite == Overwrite::yes);
  if (part.error() != 0) return tl::unexpected(systemError(part.error()));
  return size;
}

}  // namespace quorl

#pragma once

#include <cstdint>
#include <filesystem>
#include <string>

#include <tl/expected.hpp>

#include "platform/Services.h"

namespace quorl {

enum class Overwrite { no, yes };

struct TextFileError {
  enum class Kind {
    exists,      // there is a file of that name, and it was not to be overwritten
    notWritten,  // the system says why in `reason`
  };
  Kind kind;
  std::string reason;
};

/// Writes `text` to `path` piece by piece, readable for its owner alone, and answers its size in bytes. The file is
/// there whole or not at all: after an error what was at `path` before is still there, and nothing else is left. Any
/// thread.
tl::expected<std::uintmax_t, TextFileError> writeTextFile(const std::filesystem::path& path, const SharedText& text,
                                                          Overwrite overwrite);

}  // namespace quorl

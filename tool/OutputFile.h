#pragma once

#include <filesystem>
#include <string>
#include <string_view>

#include <tl/expected.hpp>

namespace quorl::tool {

/// Writes `text` as the whole of a file; a new one is for its owner alone. A file that is there is replaced only when
/// all is written, so that a full disk keeps it; but where nothing may be put beside it, or in its place, it is written
/// over. The error is the system's reason.
tl::expected<void, std::string> writeWholeFile(const std::filesystem::path& file, std::string_view text);

}  // namespace quorl::tool

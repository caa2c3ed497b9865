#pragma once

#include <filesystem>
#include <string>

#include <tl/expected.hpp>

namespace quorl::simulator {

/// Makes the directory if it is missing, and finds out whether a store can live there, as the store itself ends the
/// process when it cannot. The error is a line for the user: the path and the reason.
tl::expected<void, std::string> prepareDocuments(const std::filesystem::path& documents);

}  // namespace quorl::simulator

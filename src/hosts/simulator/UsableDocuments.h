#pragma once

#include <filesystem>
#include <string>

#include <tl/expected.hpp>

// The documents directory of a simulated phone, and the database file that the store keeps there.

namespace quorl::simulator {

std::filesystem::path databaseFile(const std::filesystem::path& documents);

/// Makes the directory if it is missing, and finds out whether a store can live there, as the store itself ends the
/// process when it cannot. The error is a line for the user: the path and the reason.
tl::expected<void, std::string> prepareDocuments(const std::filesystem::path& documents);

/// Fails if writing `target` would destroy a database: a part of the one in `documents`, which may be empty, or any
/// other. The error is a line for the user.
tl::expected<void, std::string> spareDatabase(const std::filesystem::path& target,
                                              const std::filesystem::path& documents);

}  // namespace quorl::simulator

#pragma once

#include <string_view>

#include "messages/MessageTable.h"

namespace quorl::tool {

/// The message class of exactly this name. Null when there is none; the user then has been told so, with the names that
/// come nearest.
const MessageTable* messageClass(std::string_view name);

}  // namespace quorl::tool

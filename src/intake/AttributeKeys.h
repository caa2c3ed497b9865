#pragma once

// Attributes that every metric has.

namespace quorl {

inline constexpr char kSubsIdKey[] = "subs_id";       // the SIM slot it is about
inline constexpr char kTimestampKey[] = "timestamp";  // when it was made, in milliseconds since 1970

}  // namespace quorl

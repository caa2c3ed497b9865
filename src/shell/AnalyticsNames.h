#pragma once

// Names of the analytics events.

namespace quorl::analytics_name {

inline constexpr char kAppLaunch[] = "AppLaunch";
inline constexpr char kUnknown[] = "unknown";

inline constexpr char kAppLaunchEvent[] = "com.ardent.quorlMenu.appLaunch";
inline constexpr char kUnknownEvent[] = "com.ardent.quorlMenu.unknown";

}  // namespace quorl::analytics_name

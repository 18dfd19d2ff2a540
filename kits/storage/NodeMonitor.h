// Codes in the "opcode" field of B_NODE_MONITOR and B_QUERY_UPDATE messages.
#pragma once

inline constexpr int B_ENTRY_CREATED = 1;
inline constexpr int B_ENTRY_REMOVED = 2;
inline constexpr int B_ENTRY_MOVED = 3;
inline constexpr int B_STAT_CHANGED = 4;
inline constexpr int B_ATTR_CHANGED = 5;
inline constexpr int B_DEVICE_MOUNTED = 6;
inline constexpr int B_DEVICE_UNMOUNTED = 7;

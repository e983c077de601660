// The error context itself: the texts of the most recent failure. Written by core/base/status alone;
// read by core/base/message and by the tests, which link the static library.
#pragma once

namespace tevpf {

inline constexpr int kItemSize = 257;   // 256 characters and the terminator
inline constexpr int kValueSize = 260;  // 259 characters and the terminator

extern char err_item[kItemSize];    // what failed
extern char err_value[kValueSize];  // where, or the type or limit that was violated

}  // namespace tevpf

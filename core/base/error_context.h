// The error context: the two texts of the most recent failure. Only core/base/status writes it;
// core/base/message and the tests, which link the static library, read it.
#pragma once

namespace tevpf {

inline constexpr int kItemSize = 257;   // 256 characters and the terminator
inline constexpr int kValueSize = 260;  // 259 characters and the terminator

extern char err_item[kItemSize];    // what failed
extern char err_value[kValueSize];  // where, or the type or limit that was violated

}  // namespace tevpf

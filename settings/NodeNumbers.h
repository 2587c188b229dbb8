// The node numbers with a meaning of their own.
#pragma once

namespace settings {

/// The greatest number that the line can carry. The driver takes it for "off": every access to a
/// node of this number, configured or by an override, is refused and nothing is sent.
inline constexpr int kNodeOff = 255;

}  // namespace settings

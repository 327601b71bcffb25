// FollowSystemAppearance: a window as dark as the user's other programs.
#pragma once

namespace tendril {

#ifdef _WIN32
// Makes the application dark if the user has chosen so. Call it before there is a window.
void FollowSystemAppearance();
#else
inline void FollowSystemAppearance() {}  // Qt does that
#endif

}  // namespace tendril

#pragma once

namespace platform {

/// Has the system refuse, for this program and from now on, to follow junctions that somebody without an
/// administrator's rights has made. False where the system cannot do that, where this program has no such rights itself
/// (its user's own junctions are its own then), and hosted.
bool RefusePlantedJunctions();

}  // namespace platform

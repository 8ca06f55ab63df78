#pragma once

#include <cstdint>

namespace HV {

/// What an operation of the engine gives: 0 nothing was done, 1 something was placed, anything else a failure.
using EngineResult = std::int32_t;

constexpr EngineResult kNothingDone = 0;
constexpr EngineResult kPlaced = 1;
constexpr EngineResult kFailed = -1;
/// What a deployment gives that ends early: a placement or a script failed, a dependency is missing, or somebody has
/// cancelled it.
constexpr EngineResult kDeploymentFailed = -2;

/// Results are tested as unsigned numbers, so every negative one is a failure too.
constexpr bool IsFailure(EngineResult result) {
    return static_cast<std::uint32_t>(result) > 1;
}

}  // namespace HV

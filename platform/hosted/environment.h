#pragma once

#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>

#include "platform/hosted/ignoring_case.h"

namespace hosted {

/// The environment of the machine: Windows 10's variables, and over them those of the process.
///
/// Names are compared without regard to case. Thread-safe among its own calls.
class Environment {
public:
    /// The variables of a Windows 10 machine whose only user is `account`.
    explicit Environment(const std::string& account);

    [[nodiscard]] std::optional<std::string> Get(std::string_view name) const;
    /// Sets the variable in the process, so that child processes see it too; no value removes it altogether.
    void Set(const std::string& name, const std::optional<std::string>& value);
    /// `text` with each `%NAME%` replaced by the variable's value; an unknown name stays as it stands.
    [[nodiscard]] std::string Expand(std::string_view text) const;

private:
    mutable std::mutex mutex_;
    std::map<std::string, std::string, LessIgnoringCase> variables_;
};

}  // namespace hosted

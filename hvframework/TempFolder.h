#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "platform/held_folder.h"

namespace HVL {

/// A new folder in the folder for temporary files, of a random name, that belongs to this run alone: from its first
/// moment on nobody else can look into it or put anything there, and it stays in its place until it is let go.
///
/// The folder itself outlives the object; whoever made it deletes it, after LetGo(). Not thread-safe.
class TempFolder {
public:
    /// None.
    TempFolder() = default;

    /// Makes one whose name begins with `prefix`, as MakeTempPath() gives names. A name that is there already is left
    /// alone, and another one is tried. IsThere() tells whether one could be made.
    explicit TempFolder(std::string_view prefix);

    /// The same with names from `nextPath`.
    explicit TempFolder(const std::function<std::string()>& nextPath);

    [[nodiscard]] bool IsThere() const { return folder_ != nullptr; }

    /// Empty when there is none.
    [[nodiscard]] std::string Path() const { return folder_ ? folder_->Path() : std::string(); }

    /// Gives up the hold, without which the folder can be deleted. There is none afterwards.
    void LetGo() { folder_.reset(); }

private:
    std::unique_ptr<platform::HeldFolder> folder_;
};

}  // namespace HVL

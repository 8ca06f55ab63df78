#pragma once

#include <memory>
#include <string>

namespace platform {

/// A folder that stays where it is. As long as the object lives, whatever is reached through Path() is in this folder:
/// nobody can move it away, or put a link or another folder in its place.
///
/// On Windows it is held open without sharing its deletion, which also keeps every folder above it where it is. Hosted,
/// where a folder's owner may rename what is in it whoever holds it, the machine reaches what is below Path() through
/// the open folder and not through its name. The folder cannot be deleted before the object has gone.
class HeldFolder {
public:
    virtual ~HeldFolder() = default;
    HeldFolder(const HeldFolder&) = delete;
    HeldFolder& operator=(const HeldFolder&) = delete;

    /// The path that it was asked for under; where that leads through a link, the one that it leads to.
    [[nodiscard]] virtual const std::string& Path() const = 0;

protected:
    HeldFolder() = default;
};

/// Why there is no folder.
enum class NoFolder { Taken, Failed };

/// Makes a folder that belongs to this account and to nobody else, from its first moment on: on Windows an elevated
/// program's is the administrators', for them and the system alone, any other program's is its user's alone, and what
/// is made in it is for the same; hosted the mode is 0700. Then looks at what has been made, and whose it is.
///
/// The parent of `path` is there. Null when there is no such folder: `reason` is Taken when something of that
/// name is there already, which is left alone, else Failed.
std::unique_ptr<HeldFolder> MakePrivateFolder(const std::string& path, NoFolder& reason);

/// Holds the folder at `path`, so that something can be put into it or taken out of it.
///
/// Null with `planted` the path of a link on the way there that somebody made whom this program does not trust: on
/// Windows anybody but the administrators, the system and TrustedInstaller, and this account while it has no
/// administrator's rights; hosted anybody but root and this account. A link that these made is followed. Null with
/// `planted` empty when there is no such folder, or it cannot be held.
std::unique_ptr<HeldFolder> HoldFolder(const std::string& path, std::string& planted);

/// Holds the folder at `path` unless a link stands there, whoever made it: for a folder that this program has made just
/// now, and that nobody has made a link since. Null with `isLink` when there is one; null without it when there is no
/// such folder, or it cannot be held.
std::unique_ptr<HeldFolder> HoldOwnFolder(const std::string& path, bool& isLink);

}  // namespace platform

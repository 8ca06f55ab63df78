#pragma once

#include <cstdint>
#include <string>

namespace HVL {

/// A version text such as `2.0-d1` or `13.0`, compared by number.
///
/// Version texts come from manifests, suite files, the registry and programs of others, and nothing guarantees their
/// shape. So reading never fails: what is no number reads as what `atoi` makes of it. The text is kept as it came; the
/// numbers are worked out anew at each comparison.
///
/// It is a value: copy it, hold it, but do not delete one through a pointer to a base, since its virtual operations are
/// exactly the five comparisons.
class Version {
public:
    Version() = default;
    explicit Version(std::string versionText);

    /// Whether this version orders before `other`: major, minor, patch, build, the first pair that differs decides.
    [[nodiscard]] virtual bool IsLess(const Version& other) const;
    /// Whether all four numbers are equal; `1.2-beta` equals `1.2.0.0`.
    [[nodiscard]] virtual bool IsEqual(const Version& other) const;
    [[nodiscard]] virtual bool IsLessOrEqual(const Version& other) const;
    [[nodiscard]] virtual bool IsGreater(const Version& other) const;
    [[nodiscard]] virtual bool IsGreaterOrEqual(const Version& other) const;

    /// The four numbers between the first three dots; a missing one is 0.
    void GetParts(std::int32_t& major, std::int32_t& minor, std::int32_t& patch, std::int32_t& build) const;

    /// Three numbers for showing and comparing host versions: before the first dot, after the first, after the last.
    /// So the third number of `1.2.3.4` is 4 here and 3 in GetParts.
    void GetShortParts(std::int32_t& major, std::int32_t& minor, std::int32_t& patch) const;

    /// Replaces the text by three decimal numbers joined by dots.
    void SetFromParts(std::uint32_t major, std::uint32_t minor, std::uint32_t patch);

    std::string text;
};

}  // namespace HVL

#pragma once

/// What the folder references in a project's metadata are made of.
namespace project::management::references {

/// Type of the head of each of the two lists.
inline constexpr char16_t const* PROJECT_PATH = u"ProjectPath";
inline constexpr char16_t const* REFERENCES = u"References";

/// Location of both heads.
inline constexpr char16_t const* HEAD_LOCATION = u"Root";

/// Type of each reference below a head; its UUID is the location.
inline constexpr char16_t const* REFERENCE = u"Reference";

/// Type of a reference's node.
inline constexpr char16_t const* NODE = u"Info";

/// Keys of a reference.
inline constexpr char16_t const* STORED_PATH_KEY = u"Ref";
inline constexpr char16_t const* TYPE_KEY = u"Type";

} // namespace project::management::references

#pragma once

namespace projectctl {

/// The category whose labels are the owners of files, for CODEOWNERS.
inline constexpr char16_t const* ownerCategory = u"Owner";

} // namespace projectctl

#pragma once

#include <string_view>

/// The sources of the page, which the build embeds: the files of page/ and the English texts.
namespace projectctl::page {

extern std::string_view const html; ///< with places such as {{style}}, which `assemblePage` fills
extern std::string_view const style;
extern std::string_view const libraries; ///< scripts of others
extern std::string_view const script;
extern std::string_view const texts;

} // namespace projectctl::page

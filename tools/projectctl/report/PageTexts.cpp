#include "report/PageTexts.hpp"

#include <algorithm>
#include <cstddef>
#include <string_view>

#include "fl/i18n/MessageCatalog.hpp"
#include "fl/i18n/Utf8.hpp"
#include "report/PageSources.hpp"
#include "resource_core/BaseMsgID.hpp"

/// The compiled texts of texts/page, which the build embeds in the tool.
extern "C" __attribute__((visibility("hidden"))) unsigned char const projectctl_page[];

namespace projectctl {

namespace {

constexpr char const* catalogName = "projectctl:page";

/// A text of the page. Each placeholder becomes itself: the page replaces it.
class PageText : public resource_core::BaseMsgID {
public:
    explicit PageText(std::string name) : BaseMsgID(catalogName, std::move(name), mostArguments) {
        for (std::size_t slot = 0; slot < mostArguments; ++slot) {
            setArgument(slot, '{' + std::to_string(slot) + '}');
        }
    }

private:
    static constexpr std::size_t mostArguments = 3;
};

/// The name in a line of the catalog's source, `    Name { "text" }`; empty for another line.
std::string nameIn(std::string_view line) {
    constexpr std::string_view indent = "    ";
    if (!line.starts_with(indent) || line.find(" { ") == std::string_view::npos) {
        return {};
    }
    line.remove_prefix(indent.size());
    return std::string(line.substr(0, line.find(' ')));
}

} // namespace

std::string pageText(std::string const& name) {
    using fl::i18n::MessageCatalog;
    MessageCatalog::registerCatalog(catalogName, "projectctl_page", projectctl_page);
    return fl::i18n::toUtf8(MessageCatalog::get_message(PageText(name)));
}

std::vector<std::pair<std::string, std::string>> pageTexts() {
    std::vector<std::pair<std::string, std::string>> result;
    auto lines = page::texts;
    while (!lines.empty()) {
        auto const end = std::min(lines.find('\n'), lines.size() - 1);
        auto name = nameIn(lines.substr(0, end));
        lines.remove_prefix(end + 1);
        if (!name.empty()) {
            auto text = pageText(name);
            result.emplace_back(std::move(name), std::move(text));
        }
    }
    return result;
}

} // namespace projectctl

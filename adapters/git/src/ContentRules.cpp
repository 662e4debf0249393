#include "ContentRules.hpp"

#include <algorithm>
#include <array>

#include <strings.h>

namespace project::git {

namespace {

bool isSpecified(char const* attribute) {
    return git_attr_value(attribute) != GIT_ATTR_VALUE_UNSPECIFIED;
}

std::string textOf(char const* attribute) {
    return git_attr_value(attribute) == GIT_ATTR_VALUE_STRING ? attribute : "";
}

bool isPlainUtf8(std::string const& encoding) {
    return strcasecmp(encoding.c_str(), "UTF-8") == 0 || strcasecmp(encoding.c_str(), "UTF8") == 0;
}

} // namespace

ContentRules::ContentRules(Repository const& repository) : repository_(repository) {
    auto const lineEnds = repository.configured("core.autocrlf");
    areLineEndsConverted_ = lineEnds == "input" || repository.isSet("core.autocrlf", false);
}

Conversion ContentRules::conversionOf(TreePath const& path) {
    std::array<char const*, 6> names{"filter", "working-tree-encoding", "text", "eol", "crlf", "ident"};
    std::array<char const*, names.size()> values{};
    require(git_attr_get_many(values.data(), repository_.get(), GIT_ATTR_CHECK_FILE_THEN_INDEX, path.c_str(),
                              names.size(), names.data()),
            repository_.workTree().onDisk(path), "the attributes of the file can't be read");
    Conversion result{areLineEndsConverted_ || std::any_of(values.begin() + 2, values.end(), isSpecified),
                      ""};
    auto const driver = textOf(values[0]);
    auto const encoding = textOf(values[1]);
    if (!driver.empty() && isConfigured(driver)) {
        result.foreign = "the filter driver \"" + driver + '"';
    } else if (!encoding.empty() && !isPlainUtf8(encoding)) {
        result.foreign = "the encoding \"" + encoding + '"';
    }
    return result;
}

bool ContentRules::isConfigured(std::string const& driver) {
    auto const known = drivers_.find(driver);
    if (known != drivers_.end()) {
        return known->second;
    }
    auto const section = "filter." + driver + '.';
    bool const result = !repository_.configured(section + "clean").empty() ||
                        !repository_.configured(section + "process").empty() ||
                        repository_.isSet(section + "required", false);
    return drivers_.try_emplace(driver, result).first->second;
}

} // namespace project::git

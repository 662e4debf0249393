#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "output/Kind.hpp"

namespace projectctl {

/// Writes a JSON object to standard output, on one line.
///
/// Order of use: begin, then the members, then end.
class JsonObject {
public:
    void begin();
    void addText(std::string_view key, std::u16string_view text);
    void addList(std::string_view key, std::vector<std::u16string> const& texts);

    /// Adds several texts, each by its name, as a nested object.
    using Texts = std::vector<std::pair<std::u16string, std::u16string>>;
    void addTexts(std::string_view key, Texts const& texts);

    void addFlag(std::string_view key, bool value);

    /// Adds the members "path" and "kind" of a file.
    void addFile(std::u16string_view path, Kind kind);

    void end();

private:
    void addKey(std::string_view key);

    bool isFirstMember_ = true;
};

} // namespace projectctl

#pragma once

#include <cstddef>
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
    void addNumber(std::string_view key, std::size_t value);

    /// Adds a thing that has a name and a UUID, such as a category, as a nested object.
    void addNamed(std::string_view key, std::u16string const& name, std::u16string const& uuid) {
        addTexts(key, {{u"uuid", uuid}, {u"name", name}});
    }

    /// Adds a key, whose value the caller writes next.
    void addKey(std::string_view key);

    /// Adds the members "path" and "kind" of a file.
    void addFile(std::u16string_view path, Kind kind);

    void end();

private:
    bool isFirstMember_ = true;
};

} // namespace projectctl

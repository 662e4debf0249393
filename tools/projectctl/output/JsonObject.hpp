#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "output/Kind.hpp"

namespace projectctl {

/// A JSON object on standard output, in one line.
///
/// The order of use: begin, then its members, then end.
class JsonObject {
public:
    void begin();
    void addText(std::string_view key, std::u16string_view text);
    void addList(std::string_view key, std::vector<std::u16string> const& texts);

    /// Several texts by name, as an object of their own.
    using Texts = std::vector<std::pair<std::u16string, std::u16string>>;
    void addTexts(std::string_view key, Texts const& texts);

    void addFlag(std::string_view key, bool value);

    /// The members "path" and "kind" of a file.
    void addFile(std::u16string_view path, Kind kind);

    void end();

private:
    void addKey(std::string_view key);

    bool isFirstMember_ = true;
};

} // namespace projectctl

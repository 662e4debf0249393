#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Kind.hpp"

namespace projectctl {

/// A JSON array of objects on standard output, one a line.
///
/// The order of use: for each object begin, then its members; finish at the end.
class JsonRows {
public:
    void begin();
    void addText(std::string_view key, std::u16string_view text);

    /// Several texts by name, as an object of their own.
    using Texts = std::vector<std::pair<std::u16string, std::u16string>>;
    void addTexts(std::string_view key, Texts const& texts);

    void addFlag(std::string_view key, bool value);

    /// The members "path" and "kind" of a file.
    void addFile(std::u16string_view path, Kind kind);

    /// Ends the array, which is part of something.
    void finish();

    /// Ends the array and the line: the output is nothing but this array.
    void finishOutput();

private:
    void addKey(std::string_view key);

    bool isEmpty_ = true;       ///< no object has begun
    bool isFirstMember_ = true; ///< of the object
};

} // namespace projectctl

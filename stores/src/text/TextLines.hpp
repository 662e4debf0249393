#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace project::stores {

/// The first line of every text, without its line end.
inline constexpr std::string_view firstLine = R"({"format":"project-definition","version":1})";

/// The last line of every body, without its line end.
inline constexpr std::string_view endLine = R"({"end":"project-definition"})";

/// Checks the first line of a text.
/// @param line without its end.
/// @param hasEnd false if the text ends with this line and without a line end.
/// @param file the name of the file in errors.
/// @return false if the line is only the beginning of a first line.
/// @throws StoreError if the file is not a project's text, or if it has a later format.
bool checkFirstLine(std::string_view line, bool hasEnd, std::string const& file);

/// One line of a text.
struct TextLine {
    std::string_view text;  ///< without its end, "\n" or "\r\n"
    std::string_view whole; ///< with its end
    std::size_t number;     ///< counted from 1

    bool hasEnd() const noexcept { return whole.ends_with('\n'); }

    /// True if the line ends with "\n" and not with "\r\n".
    bool hasPlainEnd() const noexcept { return whole.size() == text.size() + 1; }
};

/// The conflict markers that a merge leaves in a text, around the lines that it could not merge.
enum class MergeMarker {
    None,
    Ours,   ///< "<<<<<<<": the lines of one side follow
    Base,   ///< "|||||||": the lines of the common ancestor follow
    Theirs, ///< "=======": the lines of the other side follow
    End,    ///< ">>>>>>>"
};

/// The conflict marker in a line, or None. No line of the format begins like a marker.
inline MergeMarker mergeMarker(std::string_view line) noexcept {
    constexpr std::size_t length = 7;
    if (line.size() < length || (line.size() > length && line[length] != ' ') ||
        line.find_first_not_of(line.front()) < length) {
        return MergeMarker::None;
    }
    switch (line.front()) {
    case '<':
        return MergeMarker::Ours;
    case '|':
        return MergeMarker::Base;
    case '=':
        return MergeMarker::Theirs;
    case '>':
        return MergeMarker::End;
    default:
        return MergeMarker::None;
    }
}

/// Iterates over the lines of a text. The last line may lack its end.
class LineWalk {
public:
    /// @param offset the position of the first line. @param number the number of that line.
    LineWalk(std::string_view text, std::size_t offset, std::size_t number) noexcept
        : text_(text), offset_(offset), number_(number) {}

    /// @return false at the end of the text.
    bool next() noexcept {
        if (offset_ >= text_.size()) {
            return false;
        }
        std::size_t const end = text_.find('\n', offset_);
        std::string_view const whole = text_.substr(offset_, end == text_.npos ? end : end + 1 - offset_);
        std::size_t const endLength = whole.ends_with("\r\n") ? 2 : whole.ends_with('\n') ? 1 : 0;
        line_ = {whole.substr(0, whole.size() - endLength), whole, number_++};
        offset_ += whole.size();
        return true;
    }

    TextLine const& line() const noexcept { return line_; }

    /// The position of the next line.
    std::size_t offset() const noexcept { return offset_; }

private:
    std::string_view text_;
    std::size_t offset_;
    std::size_t number_;
    TextLine line_{};
};

} // namespace project::stores

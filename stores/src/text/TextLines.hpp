#pragma once

#include <cstddef>
#include <string_view>

namespace project::stores {

/// One line of a text.
struct TextLine {
    std::string_view text;  ///< without its end, "\n" or "\r\n"
    std::string_view whole; ///< with its end
    std::size_t number;     ///< counted from 1

    bool hasEnd() const noexcept { return whole.ends_with('\n'); }

    bool endsPlainly() const noexcept { return whole.size() == text.size() + 1; }
};

/// What a merge leaves in a text around lines that it could not merge.
enum class MergeMarker {
    None,
    Ours,   ///< "<<<<<<<": the lines of one side follow
    Base,   ///< "|||||||": the lines of their common ancestor follow
    Theirs, ///< "=======": the lines of the other side follow
    End,    ///< ">>>>>>>"
};

/// The marker that a line is. No line of the format begins like one.
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

/// Goes through the lines of a text. A last line may lack its end.
class LineWalk {
public:
    /// @param offset where the first line begins. @param number that line's.
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

    /// Where the next line begins.
    std::size_t offset() const noexcept { return offset_; }

private:
    std::string_view text_;
    std::size_t offset_;
    std::size_t number_;
    TextLine line_{};
};

} // namespace project::stores

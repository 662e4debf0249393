#include "TextInput.hpp"

#include <algorithm>

#include "project/stores/StoreError.hpp"
#include "text/TextLines.hpp"
#include "text/TextSum.hpp"

namespace project::fuzz {

namespace {

constexpr std::size_t sumLength = 32;

class TailWriter {
public:
    explicit TailWriter(std::string_view body) {
        stores::TextSum sum;
        sum.addLines(body);
        after_ = sum.hex();
    }

    void line(stores::TextLine const& line) {
        if (line.text.starts_with('#')) {
            close(line.text.substr(1));
        } else {
            lines_.push_back(line.text);
            piece_ += line.whole;
        }
    }

    std::vector<std::string> finish() && {
        if (!piece_.empty()) {
            pieces_.push_back(std::move(piece_));
        }
        return std::move(pieces_);
    }

private:
    void close(std::string_view form) {
        std::string const after = form == "!" ? std::string(sumLength, '0') : after_;
        std::string const count =
            form.empty() || form == "!" || form == "?" ? std::to_string(lines_.size()) : std::string(form);
        stores::TextSum sum;
        for (std::string_view const line : lines_) {
            sum.add(line);
        }
        sum.add(after);
        after_ = form == "?" ? std::string(sumLength, 'f') : sum.hex();
        piece_ +=
            R"({"batch":{"lines":)" + count + R"(,"after":")" + after + R"(","sum":")" + after_ + "\"}}\n";
        pieces_.push_back(std::move(piece_));
        piece_.clear();
        lines_.clear();
    }

    std::string after_;
    std::vector<std::string_view> lines_;
    std::string piece_;
    std::vector<std::string> pieces_;
};

} // namespace

std::string framed(std::string_view lines, std::string_view tail) {
    std::string text(stores::firstLine);
    text += '\n';
    text += lines;
    text += lines.empty() || lines.ends_with('\n') ? "" : "\n";
    text += stores::endLine;
    text += '\n';
    text += tail;
    return text;
}

std::vector<std::string> tailOf(std::string_view input, std::string_view body) {
    TailWriter writer(body);
    stores::LineWalk walk(input, 0, 1);
    while (walk.next()) {
        writer.line(walk.line());
    }
    return std::move(writer).finish();
}

std::string textOf(std::string_view input) {
    if (input.starts_with(R"({"format)") || input.starts_with("<<<<<<<")) {
        return std::string(input);
    }
    constexpr std::string_view separator = "\n+\n";
    std::size_t const end = input.find(separator);
    std::string text = framed(input.substr(0, end));
    if (end != input.npos) {
        for (std::string const& piece : tailOf(input.substr(end + separator.size()), text)) {
            text += piece;
        }
    }
    return text;
}

std::array<std::string_view, 3> partsOf(std::string_view input) {
    constexpr std::string_view separator = "\n---\n";
    std::array<std::string_view, 3> parts;
    for (std::string_view& part : parts) {
        std::size_t const end = std::min(input.find(separator), input.size());
        part = input.substr(0, end);
        input.remove_prefix(std::min(end + separator.size(), input.size()));
    }
    return parts;
}

std::optional<stores::ProjectText> readText(std::string bytes) {
    try {
        return stores::ProjectText::read(std::move(bytes), "input");
    } catch (stores::StoreError const&) {
        return std::nullopt;
    }
}

} // namespace project::fuzz

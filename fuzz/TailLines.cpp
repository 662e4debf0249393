#include "TailLines.hpp"

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
        anchor_ = sum.hex();
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
    void close(std::string_view how) {
        std::string const after = how == "!" ? std::string(sumLength, '0') : anchor_;
        std::string const count =
            how.empty() || how == "!" || how == "?" ? std::to_string(lines_.size()) : std::string(how);
        stores::TextSum sum;
        for (std::string_view const line : lines_) {
            sum.add(line);
        }
        sum.add(after);
        anchor_ = how == "?" ? std::string(sumLength, 'f') : sum.hex();
        piece_ +=
            R"({"batch":{"lines":)" + count + R"(,"after":")" + after + R"(","sum":")" + anchor_ + "\"}}\n";
        pieces_.push_back(std::move(piece_));
        piece_.clear();
        lines_.clear();
    }

    std::string anchor_;
    std::vector<std::string_view> lines_;
    std::string piece_;
    std::vector<std::string> pieces_;
};

} // namespace

std::vector<std::string> tailOf(std::string_view input, std::string_view body) {
    TailWriter writer(body);
    stores::LineWalk walk(input, 0, 1);
    while (walk.next()) {
        writer.line(walk.line());
    }
    return std::move(writer).finish();
}

} // namespace project::fuzz

#include "text/TextTail.hpp"

#include <algorithm>
#include <charconv>
#include <optional>
#include <span>
#include <utility>

#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"
#include "text/TextSum.hpp"

namespace project::stores {

namespace {

constexpr std::size_t sumLength = 32;

using Lines = std::span<TextLine const>;

struct Closing {
    std::size_t lines;
    std::string_view after;
    std::string_view sum;
};

bool isSum(std::string_view text) noexcept {
    return text.size() == sumLength && text.find_first_not_of("0123456789abcdef") == std::string_view::npos;
}

std::string closingLine(std::size_t lines, std::string_view after, std::string_view sum) {
    std::string line = R"({"batch":{"lines":)";
    line += std::to_string(lines);
    line += R"(,"after":")";
    line += after;
    line += R"(","sum":")";
    line += sum;
    line += R"("}})";
    return line;
}

/// A closing line is taken only to the byte as it is written, so that no change of it goes unseen.
std::optional<Closing> readClosing(std::string_view line) {
    constexpr std::string_view opening = R"({"batch":{"lines":)";
    constexpr std::string_view beforeAfter = R"(,"after":")";
    constexpr std::string_view beforeSum = R"(","sum":")";
    if (!line.starts_with(opening)) {
        return std::nullopt;
    }
    Closing closing{};
    char const* const end = line.data() + line.size();
    char const* const behind = std::from_chars(line.data() + opening.size(), end, closing.lines).ptr;
    std::string_view const rest(behind, static_cast<std::size_t>(end - behind));
    if (rest.size() < beforeAfter.size() + sumLength + beforeSum.size() + sumLength) {
        return std::nullopt;
    }
    closing.after = rest.substr(beforeAfter.size(), sumLength);
    closing.sum = rest.substr(beforeAfter.size() + sumLength + beforeSum.size(), sumLength);
    bool const whole = isSum(closing.after) && isSum(closing.sum) &&
                       line == closingLine(closing.lines, closing.after, closing.sum);
    return whole ? std::optional(closing) : std::nullopt;
}

std::string sumOf(Lines lines, std::string_view after) {
    TextSum sum;
    for (TextLine const& line : lines) {
        sum.add(line.text);
    }
    sum.add(after);
    return sum.hex();
}

/// The changes of some lines, up to the first malformed one, which is then told.
struct ParsedLines {
    Batch changes;
    TextLine const* malformed = nullptr;
    char const* problem = nullptr;
};

ParsedLines parseLines(Lines lines) {
    ParsedLines parsed;
    for (TextLine const& line : lines) {
        ParsedLine one = parseLine(line.text);
        if (!one.change) {
            parsed.malformed = &line;
            parsed.problem = one.problem;
            break;
        }
        parsed.changes.push_back(*std::move(one.change));
    }
    return parsed;
}

class TailReader {
public:
    explicit TailReader(std::string anchor) { reading_.anchor = std::move(anchor); }

    TailReading read(Lines lines) {
        std::size_t begin = 0;
        for (std::size_t i = 0; i < lines.size(); ++i) {
            if (auto const closing = readClosing(lines[i].text)) {
                batch(lines.subspan(begin, i - begin), lines[i], *closing);
                begin = i + 1;
            }
        }
        end(lines.subspan(begin));
        std::sort(reading_.faults.begin(), reading_.faults.end(),
                  [](Fault const& left, Fault const& right) { return left.line < right.line; });
        return std::move(reading_);
    }

private:
    /// Lines that may be damage or what a dead writer left: what follows them decides.
    struct Open {
        Lines lines; ///< with the closing line, if they have one
        std::size_t line;
        std::string problem;
        bool malformed;
    };

    void batch(Lines before, TextLine const& closing, Closing const& told) {
        std::size_t const count = std::min(told.lines, before.size());
        Lines const lines = before.last(count);
        ParsedLines parsed = parseLines(lines);
        if (count < told.lines || sumOf(lines, told.after) != told.sum) {
            suspect(before, closing);
        } else if (parsed.malformed != nullptr) {
            settle();
            damage({lines.data(), count + 1}, parsed.malformed->number, parsed.problem);
        } else {
            rightBatch(before.first(before.size() - count), std::move(parsed.changes), closing, told);
        }
        reading_.anchor = told.sum;
    }

    void suspect(Lines before, TextLine const& closing) {
        Lines const lines{before.data(), before.size() + 1};
        ParsedLines const parsed = parseLines(before);
        if (parsed.malformed != nullptr) {
            open_.push_back({lines, parsed.malformed->number, parsed.problem, true});
        } else {
            open_.push_back(
                {lines, closing.number, "the batch that ends here does not have its checksum", false});
        }
    }

    void rightBatch(Lines leftOver, Batch changes, TextLine const& closing, Closing const& told) {
        bool const afterDamage = !open_.empty() || !leftOver.empty();
        settle();
        if (!leftOver.empty()) {
            damage(leftOver, leftOver.front().number, "a batch has no closing line");
        }
        bool const chains = afterDamage || told.after == reading_.anchor;
        if (!chains) {
            fault(Fault::Kind::Irregular, closing.number,
                  "the batch that ends here was not written on top of what stands before it");
        }
        reading_.batches.push_back({std::move(changes), chains, std::string(told.sum)});
    }

    void end(Lines leftOver) {
        std::size_t torn = open_.size();
        while (torn > 0 && open_[torn - 1].malformed) {
            --torn;
        }
        std::optional<std::size_t> line;
        if (torn < open_.size()) {
            line = open_[torn].lines.front().number;
        } else if (!leftOver.empty()) {
            line = leftOver.front().number;
        }
        open_.resize(torn);
        settle();
        if (line) {
            reading_.torn = true;
            fault(Fault::Kind::TornTail, *line, "a batch was not written to its end");
        }
    }

    void settle() {
        for (Open const& open : open_) {
            damage(open.lines, open.line, open.problem);
        }
        open_.clear();
    }

    void damage(Lines lines, std::size_t line, std::string problem) {
        fault(Fault::Kind::Damage, line, std::move(problem));
        for (TextLine const& damaged : lines) {
            reading_.damage.emplace(damaged.number, damaged.whole);
        }
    }

    void fault(Fault::Kind kind, std::size_t line, std::string problem) {
        reading_.faults.push_back({kind, line, std::move(problem)});
    }

    TailReading reading_;
    std::vector<Open> open_;
};

} // namespace

TailReading readTail(std::vector<TextLine> const& lines, std::string anchor) {
    return TailReader(std::move(anchor)).read(lines);
}

void takeIn(TextContent& content, TailReading const& tail) {
    for (TailBatch const& batch : tail.batches) {
        for (Change const& change : batch.changes) {
            batch.chains ? content.apply(change) : content.join(change);
        }
    }
}

std::string writeBatch(Batch const& batch, std::string_view anchor) {
    std::string text;
    TextSum sum;
    for (Change const& change : batch) {
        requireWritable(change);
        std::size_t const begin = text.size();
        appendChangeLine(text, change);
        sum.add(std::string_view(text).substr(begin));
        text += '\n';
    }
    sum.add(anchor);
    text += closingLine(batch.size(), anchor, sum.hex());
    text += '\n';
    return text;
}

} // namespace project::stores

#include "text/TextTail.hpp"

#include <algorithm>
#include <charconv>
#include <optional>
#include <span>
#include <utility>

#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"
#include "text/TextSum.hpp"
#include "texts/ErrorTexts.hpp"

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

std::string writeClosing(std::size_t lines, std::string_view after, std::string_view sum) {
    std::string line = R"({"batch":{"lines":)";
    line += std::to_string(lines);
    line += R"(,"after":")";
    line += after;
    line += R"(","sum":")";
    line += sum;
    line += R"("}})";
    return line;
}

/// Accepts a closing line only if it matches the written form to the byte, so that every changed byte is
/// detected.
std::optional<Closing> readClosing(std::string_view line) {
    constexpr std::string_view opening = R"({"batch":{"lines":)";
    constexpr std::string_view beforeAfter = R"(,"after":")";
    constexpr std::string_view beforeSum = R"(","sum":")";
    if (!line.starts_with(opening)) {
        return std::nullopt;
    }
    Closing closing{};
    char const* const end = line.data() + line.size();
    char const* const afterNumber = std::from_chars(line.data() + opening.size(), end, closing.lines).ptr;
    std::string_view const rest(afterNumber, static_cast<std::size_t>(end - afterNumber));
    if (rest.size() < beforeAfter.size() + sumLength + beforeSum.size() + sumLength) {
        return std::nullopt;
    }
    closing.after = rest.substr(beforeAfter.size(), sumLength);
    closing.sum = rest.substr(beforeAfter.size() + sumLength + beforeSum.size(), sumLength);
    bool const isValid = isSum(closing.after) && isSum(closing.sum) &&
                         line == writeClosing(closing.lines, closing.after, closing.sum);
    return isValid ? std::optional(closing) : std::nullopt;
}

std::string sumOf(Lines lines, std::string_view after) {
    TextSum sum;
    for (TextLine const& line : lines) {
        sum.add(line.text);
    }
    sum.add(after);
    return sum.hex();
}

/// The changes of some lines, up to the first unreadable line.
struct ParsedLines {
    Batch changes;
    TextLine const* unreadable = nullptr;
    char const* problem = nullptr;
};

ParsedLines parseLines(Lines lines) {
    ParsedLines parsed;
    for (TextLine const& line : lines) {
        ParsedLine one = parseLine(line.text);
        if (!one.change) {
            parsed.unreadable = &line;
            parsed.problem = one.problem;
            break;
        }
        parsed.changes.push_back(*std::move(one.change));
    }
    return parsed;
}

class TailReader {
public:
    explicit TailReader(std::string after) { reading_.nextAfter = std::move(after); }

    TailReading read(Lines lines) {
        std::size_t begin = 0;
        for (std::size_t i = 0; i < lines.size(); ++i) {
            if (auto const closing = readClosing(lines[i].text)) {
                readBatch(lines.subspan(begin, i - begin), lines[i], *closing);
                begin = i + 1;
            }
        }
        finish(lines.subspan(begin));
        std::sort(reading_.faults.begin(), reading_.faults.end(),
                  [](Fault const& left, Fault const& right) { return left.line < right.line; });
        return std::move(reading_);
    }

private:
    /// A batch with a wrong checksum. It is damage or part of a torn tail; the lines after it decide.
    struct Suspect {
        Lines lines; ///< including the closing line
        std::size_t line;
        char const* problem; ///< the name of its text
        bool isUnreadable;   ///< a line of it is
    };

    /// @param before the lines since the previous closing line.
    void readBatch(Lines before, TextLine const& closingLine, Closing const& closing) {
        std::size_t const count = std::min(closing.lines, before.size());
        Lines const lines = before.last(count);
        ParsedLines parsed = parseLines(lines);
        if (count < closing.lines || sumOf(lines, closing.after) != closing.sum) {
            addSuspect(before, closingLine);
        } else if (parsed.unreadable != nullptr) {
            addSuspectsAsDamage();
            addDamage({lines.data(), count + 1}, parsed.unreadable->number, parsed.problem);
        } else {
            addBatch(before.first(before.size() - count), std::move(parsed.changes), closingLine, closing);
        }
        reading_.nextAfter = closing.sum;
    }

    void addSuspect(Lines before, TextLine const& closingLine) {
        Lines const lines{before.data(), before.size() + 1};
        ParsedLines const parsed = parseLines(before);
        if (parsed.unreadable != nullptr) {
            suspects_.push_back({lines, parsed.unreadable->number, parsed.problem, true});
        } else {
            suspects_.push_back({lines, closingLine.number, "BatchSumWrong", false});
        }
    }

    /// Adds a valid batch. @param extra lines before it that belong to no batch.
    void addBatch(Lines extra, Batch changes, TextLine const& closingLine, Closing const& closing) {
        bool const isAfterDamage = !suspects_.empty() || !extra.empty();
        addSuspectsAsDamage();
        if (!extra.empty()) {
            addDamage(extra, extra.front().number, "BatchOpen");
        }
        bool const isChained = isAfterDamage || closing.after == reading_.nextAfter;
        if (!isChained) {
            addFault(Fault::Kind::Irregular, closingLine.number, "BatchUnchained");
        }
        reading_.batches.push_back({std::move(changes), isChained, std::string(closing.sum)});
    }

    /// Decides on the suspects at the end of the tail and on the lines after the last closing line.
    void finish(Lines extra) {
        std::size_t torn = suspects_.size();
        while (torn > 0 && suspects_[torn - 1].isUnreadable) {
            --torn;
        }
        std::optional<std::size_t> line;
        if (torn < suspects_.size()) {
            line = suspects_[torn].lines.front().number;
        } else if (!extra.empty()) {
            line = extra.front().number;
        }
        suspects_.resize(torn);
        addSuspectsAsDamage();
        if (line) {
            reading_.isTorn = true;
            addFault(Fault::Kind::TornTail, *line, "BatchTorn");
        }
    }

    void addSuspectsAsDamage() {
        for (Suspect const& suspect : suspects_) {
            addDamage(suspect.lines, suspect.line, suspect.problem);
        }
        suspects_.clear();
    }

    void addDamage(Lines lines, std::size_t line, char const* problem) {
        addFault(Fault::Kind::Damage, line, problem);
        for (TextLine const& damaged : lines) {
            reading_.damage.emplace(damaged.number, damaged.whole);
        }
    }

    void addFault(Fault::Kind kind, std::size_t line, char const* problem) {
        reading_.faults.push_back({kind, line, errorTexts.get(problem)});
    }

    TailReading reading_;
    std::vector<Suspect> suspects_;
};

} // namespace

TailReading readTail(std::vector<TextLine> const& lines, std::string after) {
    return TailReader(std::move(after)).read(lines);
}

void applyTail(TextContent& content, TailReading const& tail) {
    for (TailBatch const& batch : tail.batches) {
        for (Change const& change : batch.changes) {
            batch.isChained ? content.apply(change) : content.join(change);
        }
    }
}

std::string writeBatch(Batch const& batch, std::string_view after, std::size_t most) {
    std::string text;
    TextSum sum;
    for (Change const& change : batch) {
        requireWritable(change);
        std::size_t const begin = text.size();
        appendChangeLine(text, change);
        sum.add(std::string_view(text).substr(begin));
        text += '\n';
        if (text.size() > most) {
            return {};
        }
    }
    sum.add(after);
    text += writeClosing(batch.size(), after, sum.hex());
    text += '\n';
    return text.size() > most ? std::string() : text;
}

std::string_view closingSum(std::string_view lines) {
    if (!lines.ends_with('\n')) {
        return {};
    }
    lines.remove_suffix(1);
    std::size_t const lineEnd = lines.rfind('\n');
    auto const closing = readClosing(lines.substr(lineEnd == std::string_view::npos ? 0 : lineEnd + 1));
    return closing ? closing->sum : std::string_view();
}

} // namespace project::stores

#include "exchange/CsvText.hpp"

#include <algorithm>

#include "cli/CommandText.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";

[[noreturn]] void failAt(std::size_t line, char const* problem) {
    throw Failure(Message("NothingImported", atLine(line, Message(problem).text()).text()));
}

} // namespace

CsvText::CsvText(std::string_view text) : rest_(text) {
    rest_.remove_prefix(rest_.starts_with(byteOrderMark) ? byteOrderMark.size() : 0);
}

std::optional<CsvText::Record> CsvText::next() {
    while (!rest_.empty() && isAtLineEnd()) {
        takeLineEnd();
    }
    if (rest_.empty()) {
        return std::nullopt;
    }
    Record result{line_, {takeField()}};
    while (rest_.starts_with(',')) {
        rest_.remove_prefix(1);
        result.fields.push_back(takeField());
    }
    takeLineEnd();
    return result;
}

std::string CsvText::takeField() {
    if (rest_.starts_with('"')) {
        auto result = takeQuoted();
        if (!rest_.starts_with(',') && !isAtLineEnd()) {
            failAt(line_, "TextBehindQuotes");
        }
        return result;
    }
    std::string result;
    while (!rest_.starts_with(',') && !isAtLineEnd()) {
        if (rest_.front() == '"') {
            failAt(line_, "QuoteInField");
        }
        result += rest_.front();
        rest_.remove_prefix(1);
    }
    return result;
}

std::string CsvText::takeQuoted() {
    std::string result;
    std::size_t const begin = line_;
    for (rest_.remove_prefix(1); !rest_.empty(); rest_.remove_prefix(1)) {
        char const byte = rest_.front();
        if (byte == '"' && !rest_.starts_with("\"\"")) {
            rest_.remove_prefix(1);
            return result;
        }
        rest_.remove_prefix(byte == '"' ? 1 : 0);
        line_ += byte == '\n' ? 1 : 0;
        result += byte;
    }
    failAt(begin, "QuoteOpen");
}

bool CsvText::isAtLineEnd() const {
    return rest_.empty() || rest_.starts_with('\n') || rest_.starts_with("\r\n");
}

void CsvText::takeLineEnd() {
    rest_.remove_prefix(std::min(rest_.size(), rest_.find('\n') == 0 ? std::size_t(1) : std::size_t(2)));
    ++line_;
}

void appendCsvRecord(std::string& out, std::initializer_list<std::string_view> fields) {
    bool isFirst = true;
    for (auto const field : fields) {
        out += isFirst ? "" : ",";
        isFirst = false;
        if (field.find_first_of(",\"\r\n") == std::string_view::npos) {
            out += field;
            continue;
        }
        out += '"';
        for (char const byte : field) {
            out += byte == '"' ? "\"\"" : std::string_view(&byte, 1);
        }
        out += '"';
    }
    out += "\r\n";
}

} // namespace projectctl

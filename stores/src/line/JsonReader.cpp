#include "line/JsonReader.hpp"

#include <limits>

#include "texts/ErrorTexts.hpp"

namespace project::stores {

char JsonReader::peek() noexcept {
    constexpr std::string_view whiteSpace = " \t\r\n";
    while (at_ < text_.size() && whiteSpace.find(text_[at_]) != std::string_view::npos) {
        ++at_;
    }
    return problem_ == nullptr && at_ < text_.size() ? text_[at_] : '\0';
}

bool JsonReader::fail(char const* problem) noexcept {
    if (problem_ == nullptr) {
        problem_ = problem;
    }
    return false;
}

std::string JsonReader::problemText() const {
    return problem_ == nullptr ? std::string() : errorTexts.get(problem_);
}

bool JsonReader::accept(char character) noexcept {
    if (peek() != character) {
        return false;
    }
    ++at_;
    return true;
}

bool JsonReader::expect(char character) noexcept {
    return accept(character) || fail("NotJson");
}

bool JsonReader::string(std::string_view& content) noexcept {
    if (!accept('"')) {
        return fail("StringMissing");
    }
    JsonContentScan const scan = scanJsonContent(text_, at_);
    if (scan.problem != nullptr) {
        return fail(scan.problem);
    }
    content = text_.substr(at_, scan.end - at_);
    at_ = scan.end + 1;
    return true;
}

bool JsonReader::word(std::string_view expected) noexcept {
    peek();
    if (problem_ != nullptr || text_.substr(at_, expected.size()) != expected) {
        return fail("NotJson");
    }
    at_ += expected.size();
    return true;
}

bool JsonReader::number(unsigned long& value) noexcept {
    char const first = peek();
    value = 0;
    std::size_t const from = at_;
    while (at_ < text_.size() && text_[at_] >= '0' && text_[at_] <= '9') {
        auto const digit = static_cast<unsigned long>(text_[at_] - '0');
        if (value > (std::numeric_limits<unsigned long>::max() - digit) / 10) {
            return fail("NumberTooLarge");
        }
        value = value * 10 + digit;
        ++at_;
    }
    bool const hasLeadingZero = first == '0' && at_ - from > 1;
    return (problem_ == nullptr && at_ > from && !hasLeadingZero) || fail("NumberMissing");
}

bool JsonReader::end() noexcept {
    peek();
    return problem_ == nullptr && (at_ == text_.size() || fail("LineContinues"));
}

} // namespace project::stores

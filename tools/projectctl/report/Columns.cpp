#include "report/Columns.hpp"

#include <algorithm>
#include <cstddef>

namespace projectctl {

namespace {

std::size_t lengthOf(Column const& column) {
    std::size_t result = 0;
    for (auto const value : column) {
        result += std::to_string(value).size() + 1;
    }
    return result;
}

/// Values and their counts in turn.
Column runsOf(Column const& column) {
    Column result;
    for (auto const value : column) {
        if (result.empty() || result[result.size() - 2] != value) {
            result.push_back(value);
            result.push_back(0);
        }
        ++result.back();
    }
    return result;
}

/// The place of the last dot of a name, if it has a name before it; otherwise the length.
std::size_t beginOfEnding(std::u16string_view rest) {
    constexpr std::size_t longestEnding = 8;
    auto const dot = rest.rfind(u'.');
    bool const isEnding = dot != std::u16string_view::npos && dot > 0 && rest[dot - 1] != u'/' &&
                          rest.size() - dot <= longestEnding &&
                          rest.find(u'/', dot) == std::u16string_view::npos;
    return isEnding ? dot : rest.size();
}

void writeTexts(JsonWriter& json, std::vector<std::u16string> const& texts) {
    json.beginArray();
    for (auto const& text : texts) {
        json.text(text);
    }
    json.endArray();
}

void writeNumbers(JsonWriter& json, Column const& column) {
    json.beginArray();
    for (auto const value : column) {
        json.number(value);
    }
    json.endArray();
}

} // namespace

void writeColumn(JsonWriter& json, std::string_view key, Column const& column) {
    constexpr std::size_t wrapping = 9; // of {"runs":}
    json.key(key);
    auto const runs = runsOf(column);
    if (lengthOf(runs) + wrapping >= lengthOf(column)) {
        writeNumbers(json, column);
        return;
    }
    json.beginObject();
    json.key("runs");
    writeNumbers(json, runs);
    json.endObject();
}

void PathColumn::add(std::u16string_view path) {
    auto const shared =
        static_cast<std::size_t>(std::ranges::mismatch(path, std::u16string_view(last_)).in1 - path.begin());
    auto const whole = path.substr(shared);
    auto const ending = whole.substr(beginOfEnding(whole));
    auto const rest = whole.substr(0, whole.size() - ending.size());
    hasOddRest_ |= rest.empty() || rest == u"/" || rest.find(u'/', 1) != std::u16string_view::npos;
    auto const [number, isNew] = endingNumbers_.try_emplace(std::u16string(ending), endings_.size());
    if (isNew) {
        endings_.emplace_back(ending);
    }
    shared_.push_back(shared);
    rests_.emplace_back(rest);
    endingOf_.push_back(number->second);
    last_ = path;
}

void PathColumn::write(JsonWriter& json) const {
    writeColumn(json, "shared", shared_);
    writeColumn(json, "endingOf", endingOf_);
    json.key("endings");
    writeTexts(json, endings_);
    json.key("rests");
    if (hasOddRest_) {
        writeTexts(json, rests_);
        return;
    }
    std::u16string joined;
    for (auto const& rest : rests_) {
        joined += joined.empty() && &rest == &rests_.front() ? u"" : u"/";
        joined += rest;
    }
    json.text(joined);
}

} // namespace projectctl

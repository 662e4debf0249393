#include "line/LineAddress.hpp"

#include <algorithm>
#include <utility>
#include <vector>

#include "line/JsonText.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::stores {

namespace {

namespace schema = metadata::schema::files;

constexpr std::u16string_view filesType = schema::filesType;
constexpr std::u16string_view filesLocation = schema::fileListScope;
constexpr std::u16string_view nameType = schema::fileType;
constexpr std::u16string_view markerType = schema::markerType;
constexpr std::u16string_view markerLocation = schema::markerLocation;

constexpr ConstantContent filesTypeContent{filesType};
constexpr ConstantContent filesLocationContent{filesLocation};
constexpr ConstantContent filesSteps{u"\"", filesType, u"\",\"", filesLocation, u"\""};
constexpr ConstantContent nameTypeContent{nameType};
constexpr ConstantContent markerTypeContent{markerType};
constexpr ConstantContent markerLocationContent{markerLocation};

bool isPath(LineAddress const& address) noexcept {
    return address.form == LineAddress::Form::Names;
}

/// A "/" ends a name and therefore comes before every character of a name.
int pathRank(char byte) noexcept {
    return byte == '/' ? -1 : codeUnitRank(static_cast<unsigned char>(byte));
}

/// The steps of an address from the root down. They are valid as long as the address is.
std::vector<metadata::PathElement const*> stepsOf(Address const& address) {
    std::vector<metadata::PathElement const*> steps;
    address.listSteps(steps);
    return steps;
}

bool isElement(metadata::PathElement const& element, std::u16string_view type, std::u16string_view location) {
    return element.getType() == type && element.getLocation() == location;
}

bool isName(metadata::PathElement const& element) {
    std::u16string const& name = element.getLocation();
    return element.getType() == nameType && !name.empty() && name.find(u'/') == std::u16string::npos;
}

bool areWrittenAsPath(std::vector<metadata::PathElement const*> const& steps) {
    if (steps.size() < 2 || !isElement(*steps[0], filesType, filesLocation) || !isName(*steps[1])) {
        return false;
    }
    bool const hasMarker = isElement(*steps.back(), markerType, markerLocation);
    return std::all_of(steps.begin() + 2, steps.end() - (hasMarker ? 1 : 0),
                       [](metadata::PathElement const* step) { return isName(*step); });
}

} // namespace

LineSteps::LineSteps(LineAddress const& address) noexcept : address_(address) {
}

bool LineSteps::next() noexcept {
    bool const isFound = isPath(address_) ? nextName() : nextPair();
    depth_ += isFound ? 1 : 0;
    return isFound;
}

bool LineSteps::nextName() noexcept {
    std::string_view const text = address_.text;
    if (depth_ == 0) {
        type_ = filesTypeContent;
        location_ = filesLocationContent;
        return true;
    }
    if (at_ >= text.size()) {
        return false;
    }
    std::size_t const from = depth_ == 1 ? 0 : at_ + 1;
    if (from == text.size()) {
        type_ = markerTypeContent;
        location_ = markerLocationContent;
        at_ = from;
        return true;
    }
    at_ = std::min(text.find('/', from), text.size());
    type_ = nameTypeContent;
    location_ = text.substr(from, at_ - from);
    return true;
}

bool LineSteps::nextPair() noexcept {
    if (at_ >= address_.text.size() || address_.text[at_] == ']') {
        return false;
    }
    at_ += depth_ == 0 ? 0 : 1;
    type_ = quoted();
    ++at_;
    location_ = quoted();
    return true;
}

std::string_view LineSteps::quoted() noexcept {
    std::size_t const from = at_ + 1;
    std::size_t end = from;
    while (address_.text[end] != '"') {
        end += address_.text[end] == '\\' ? 2 : 1;
    }
    at_ = end + 1;
    return address_.text.substr(from, end - from);
}

LineAddress LineSteps::prefix() const noexcept {
    if (isPath(address_) && depth_ == 1) {
        return {LineAddress::Form::Steps, filesSteps};
    }
    return {address_.form, address_.text.substr(0, at_)};
}

std::strong_ordering compare(LineAddress const& left, LineAddress const& right) noexcept {
    if (isPath(left) && isPath(right)) {
        std::size_t const at = firstDifference(left.text, right.text);
        if (at == left.text.size() || at == right.text.size()) {
            return left.text.size() <=> right.text.size();
        }
        if (isUnescapedAt(left.text, at) && isUnescapedAt(right.text, at)) {
            return pathRank(left.text[at]) <=> pathRank(right.text[at]);
        }
    }
    LineSteps leftSteps(left);
    LineSteps rightSteps(right);
    while (true) {
        bool const isLeftStep = leftSteps.next();
        bool const isRightStep = rightSteps.next();
        if (!isLeftStep || !isRightStep) {
            return isLeftStep <=> isRightStep;
        }
        std::strong_ordering order = compareJsonContents(leftSteps.type(), rightSteps.type());
        if (std::is_eq(order)) {
            order = compareJsonContents(leftSteps.location(), rightSteps.location());
        }
        if (std::is_neq(order)) {
            return order;
        }
    }
}

bool isWithin(LineAddress const& address, LineAddress const& other) noexcept {
    if (isPath(address) && isPath(other)) {
        std::size_t const length = other.text.size();
        bool const isPrefix = address.text.starts_with(other.text);
        return isPrefix && (address.text.size() == length || address.text[length] == '/');
    }
    LineSteps steps(address);
    LineSteps otherSteps(other);
    while (otherSteps.next()) {
        if (!steps.next() || steps.type() != otherSteps.type() || steps.location() != otherSteps.location()) {
            return false;
        }
    }
    return true;
}

metadata::PathElement toElement(LineSteps const& step) {
    return {decodeJsonContent(step.type()), decodeJsonContent(step.location())};
}

Address toAddress(LineAddress const& address) {
    std::vector<metadata::PathElement> elements;
    LineSteps steps(address);
    while (steps.next()) {
        elements.push_back(toElement(steps));
    }
    return Address(std::move(elements));
}

bool isPathContent(std::string_view content) noexcept {
    bool const hasEmptyName =
        content.empty() || content.front() == '/' || content.find("//") != std::string_view::npos;
    if (hasEmptyName) {
        return false;
    }
    auto const slashes = std::count(content.begin(), content.end(), '/');
    return static_cast<std::size_t>(slashes) + 2 <= deepestAddress;
}

bool isWrittenAsPath(Address const& address) noexcept {
    return areWrittenAsPath(stepsOf(address));
}

bool isWrittenAsPath(LineAddress const& address) noexcept {
    LineSteps steps(address);
    if (!steps.next() || steps.type() != filesTypeContent || steps.location() != filesLocationContent) {
        return false;
    }
    std::size_t names = 0;
    while (steps.next()) {
        bool const isMarker = steps.type() == markerTypeContent && steps.location() == markerLocationContent;
        if (isMarker && names > 0) {
            return !steps.next();
        }
        if (steps.type() != nameTypeContent || steps.location().empty() ||
            steps.location().find('/') != std::string_view::npos) {
            return false;
        }
        ++names;
    }
    return names > 0;
}

void AddressText::assign(Address const& address) {
    address.listSteps(steps_);
    text_.clear();
    form_ = areWrittenAsPath(steps_) ? LineAddress::Form::Names : LineAddress::Form::Steps;
    if (form_ == LineAddress::Form::Names) {
        for (std::size_t i = 1; i < steps_.size(); ++i) {
            text_ += i == 1 ? "" : "/";
            bool const isMarker = i + 1 == steps_.size() && steps_[i]->getType() == markerType;
            appendJsonContent(text_, isMarker ? std::u16string_view() : steps_[i]->getLocation());
        }
        return;
    }
    for (metadata::PathElement const* step : steps_) {
        text_ += text_.empty() ? "" : ",";
        appendJsonString(text_, step->getType());
        text_ += ',';
        appendJsonString(text_, step->getLocation());
    }
}

} // namespace project::stores

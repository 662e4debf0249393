#include "text/ProjectText.hpp"

#include <algorithm>
#include <map>
#include <utility>

#include "line/LineParser.hpp"
#include "text/TextContent.hpp"
#include "text/TextDifference.hpp"
#include "text/TextLines.hpp"
#include "text/TextReader.hpp"
#include "text/TextSum.hpp"
#include "text/TextTail.hpp"

namespace project::stores {

class ProjectText::State {
public:
    explicit State(TextReading reading) : reading_(std::move(reading)) {}

    TextReading const& reading() const noexcept { return reading_; }

    TextContent const& content() const noexcept { return reading_.content; }

    std::string const& body() const noexcept { return reading_.content.body().bytes(); }

    /// The `after` of the next batch. The first call may compute the checksum of the body.
    std::string const& nextAfter() const {
        if (nextAfter_.empty()) {
            nextAfter_ = reading_.nextAfter;
        }
        if (nextAfter_.empty()) {
            TextSum sum;
            sum.addLines(body());
            nextAfter_ = sum.hex();
        }
        return nextAfter_;
    }

    /// True if appended bytes would follow a sound text and begin a new line.
    bool canBeExtended() const noexcept {
        bool const isSound =
            std::none_of(reading_.faults.begin(), reading_.faults.end(),
                         [](Fault const& fault) { return fault.kind != Fault::Kind::Irregular; });
        return isSound && (reading_.tail.empty() ? body() : reading_.tail).ends_with('\n');
    }

    /// Reads appended bytes. @return nothing if they are anything but complete batches that chain to the
    /// text.
    std::optional<TailReading> readAppended(std::string_view added) const {
        if (!canBeExtended() || !(added.empty() || added.ends_with('\n'))) {
            return std::nullopt;
        }
        std::vector<TextLine> lines;
        LineWalk walk(added, 0, 1);
        while (walk.next()) {
            lines.push_back(walk.line());
        }
        TailReading tail = readTail(lines, nextAfter());
        return tail.faults.empty() ? std::optional(std::move(tail)) : std::nullopt;
    }

    void append(std::string_view added, TailReading const& tail) {
        applyTail(reading_.content, tail); // all batches chain, or there would be a fault
        reading_.tail += added;
        nextAfter_ = tail.nextAfter;
    }

    /// The states of the addresses that some batches set or remove.
    std::map<Address, AddressState> statesOf(std::vector<TailBatch> const& batches) const {
        std::map<Address, AddressState> found;
        for (TailBatch const& batch : batches) {
            for (Change const& change : batch.changes) {
                found.try_emplace(change.address, content().at(change.address));
                if (change.kind == Change::Kind::Remove) {
                    for (Address const& below : content().addressesWithin(change.address)) {
                        found.try_emplace(below, content().at(below));
                    }
                }
            }
        }
        return found;
    }

private:
    TextReading reading_;
    mutable std::string nextAfter_;
};

ProjectText::ProjectText(std::unique_ptr<State> state) noexcept : state_(std::move(state)) {
}

ProjectText::ProjectText(ProjectText&&) noexcept = default;
ProjectText& ProjectText::operator=(ProjectText&&) noexcept = default;
ProjectText::~ProjectText() = default;

ProjectText ProjectText::empty() {
    TextReading reading;
    reading.content = TextContent(TextContent().write({}));
    return ProjectText(std::make_unique<State>(std::move(reading)));
}

std::optional<ProjectText> ProjectText::read(std::string bytes, std::string const& file) {
    std::optional<TextReading> reading = readText(std::move(bytes), file);
    if (!reading) {
        return std::nullopt;
    }
    return ProjectText(std::make_unique<State>(*std::move(reading)));
}

void ProjectText::children(Address const& parent, ChildSink& children) const {
    state_->content().children(parent, children);
}

Children ProjectText::children(Address const& parent) const {
    ChildCollector collector;
    children(parent, collector);
    return collector.take();
}

std::optional<std::vector<Difference>> ProjectText::extend(std::string_view added) {
    auto const tail = state_->readAppended(added);
    if (!tail) {
        return std::nullopt;
    }
    auto before = state_->statesOf(tail->batches);
    state_->append(added, *tail);
    std::vector<Difference> found;
    for (auto& [address, state] : before) {
        addIfDifferent(found, address, state, state_->content().at(address));
    }
    return found;
}

bool ProjectText::append(std::string_view lines) {
    auto const tail = state_->readAppended(lines);
    if (tail) {
        state_->append(lines, *tail);
    }
    return tail.has_value();
}

std::string const& ProjectText::sum() const {
    return state_->nextAfter();
}

std::string ProjectText::tailFor(Batch const& batch, std::size_t most) const {
    return writeBatch(batch, state_->nextAfter(), most);
}

ProjectText ProjectText::rewrittenWith(Batch const& batch) const {
    TextReading reading;
    reading.content = TextContent(state_->content().write(batch));
    return ProjectText(std::make_unique<State>(std::move(reading)));
}

std::vector<Difference> ProjectText::differencesTo(ProjectText const& other) const {
    return differences(state_->content(), other.state_->content());
}

std::size_t ProjectText::size() const noexcept {
    return bodySize() + tailSize();
}

std::size_t ProjectText::bodySize() const noexcept {
    return body().size();
}

std::size_t ProjectText::tailSize() const noexcept {
    return state_->reading().tail.size();
}

bool ProjectText::hasSameBytes(std::string_view bytes) const noexcept {
    return bytes.size() == size() && bytes.starts_with(body()) &&
           bytes.substr(bodySize()) == state_->reading().tail;
}

std::string ProjectText::bytes() const {
    return body() + state_->reading().tail;
}

std::string const& ProjectText::body() const noexcept {
    return state_->body();
}

bool ProjectText::isTidy() const noexcept {
    return state_->reading().isCanonical && state_->reading().tail.empty();
}

std::vector<std::size_t> ProjectText::linesOf(std::vector<Address> const& addresses) const {
    std::map<Address, std::size_t> own;
    std::map<Address, std::size_t> below;
    for (auto const& address : addresses) {
        own.emplace(address, 0);
        below.emplace(address, 0);
    }
    auto const text = bytes();
    LineWalk walk(text, 0, 1);
    while (walk.next()) {
        auto const parsed = parseLine(walk.line().text);
        if (!parsed.change || parsed.change->kind == Change::Kind::Remove) {
            continue;
        }
        auto address = parsed.change->address;
        if (auto const found = own.find(address); found != own.end()) {
            found->second = walk.line().number;
        }
        for (; address.depth() > 1; address = address.parent()) {
            auto const found = below.find(address.parent());
            if (found != below.end() && found->second == 0) {
                found->second = walk.line().number;
            }
        }
    }
    std::vector<std::size_t> result;
    result.reserve(addresses.size());
    for (auto const& address : addresses) {
        result.push_back(own[address] > 0 ? own[address] : below[address]);
    }
    return result;
}

std::vector<Fault> const& ProjectText::faults() const noexcept {
    return state_->reading().faults;
}

bool ProjectText::hasFault(Fault::Kind kind) const noexcept {
    return std::any_of(faults().begin(), faults().end(),
                       [kind](Fault const& fault) { return fault.kind == kind; });
}

std::string ProjectText::damagedLines() const {
    std::string lines;
    for (auto const& [number, line] : state_->reading().damage) {
        lines += line;
    }
    return lines;
}

} // namespace project::stores

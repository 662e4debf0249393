#include "ProjectText.hpp"

#include <algorithm>
#include <utility>

#include "TextContent.hpp"
#include "TextDifference.hpp"
#include "TextLines.hpp"
#include "TextReader.hpp"
#include "TextSum.hpp"
#include "TextTail.hpp"

namespace project::stores {

namespace {

/// Beyond this it costs a reader less to forget everything than to look at each address.
constexpr std::size_t mostDifferences = 4096;

} // namespace

class ProjectText::State {
public:
    explicit State(TextReading reading) : reading_(std::move(reading)) {}

    TextReading const& reading() const noexcept { return reading_; }

    TextContent const& content() const noexcept { return reading_.content; }

    std::string const& body() const noexcept { return reading_.content.body().bytes(); }

    /// The sum that the next batch has to name. Costs a walk through the body the first time.
    std::string const& anchor() const {
        if (anchor_.empty()) {
            anchor_ = reading_.anchor;
        }
        if (anchor_.empty()) {
            TextSum sum;
            sum.addLines(body());
            anchor_ = sum.hex();
        }
        return anchor_;
    }

    /// True when what is appended stands behind a whole text, in a line of its own.
    bool canBeExtended() const noexcept {
        bool const sound =
            std::none_of(reading_.faults.begin(), reading_.faults.end(),
                         [](Fault const& fault) { return fault.kind != Fault::Kind::Irregular; });
        return sound && (reading_.tail.empty() ? body() : reading_.tail).ends_with('\n');
    }

    std::vector<Address> apply(std::vector<TailBatch> const& batches) {
        std::vector<Address> touched;
        for (TailBatch const& batch : batches) {
            for (Change const& change : batch.changes) {
                touched.push_back(change.address);
                if (change.kind == Change::Kind::Remove) {
                    std::vector<Address> const below = content().standingWithin(change.address);
                    touched.insert(touched.end(), below.begin(), below.end());
                }
                reading_.content.apply(change);
            }
        }
        std::sort(touched.begin(), touched.end());
        touched.erase(std::unique(touched.begin(), touched.end()), touched.end());
        return touched;
    }

    void noteTail(std::string_view added, std::string anchor) {
        reading_.tail += added;
        anchor_ = std::move(anchor);
    }

private:
    TextReading reading_;
    mutable std::string anchor_;
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

Children ProjectText::children(Address const& parent) const {
    return state_->content().children(parent);
}

std::optional<std::vector<Address>> ProjectText::extend(std::string_view added) {
    if (!state_->canBeExtended() || !(added.empty() || added.ends_with('\n'))) {
        return std::nullopt;
    }
    std::vector<TextLine> lines;
    LineWalk walk(added, 0, 1);
    while (walk.next()) {
        lines.push_back(walk.line());
    }
    TailReading tail = readTail(lines, state_->anchor());
    if (!tail.faults.empty()) {
        return std::nullopt;
    }
    state_->noteTail(added, std::move(tail.anchor));
    return state_->apply(tail.batches);
}

std::string ProjectText::tailFor(Batch const& batch) const {
    return writeBatch(batch, state_->anchor());
}

ProjectText ProjectText::rewrittenWith(Batch const& batch) const {
    TextReading reading;
    reading.content = TextContent(state_->content().write(batch));
    return ProjectText(std::make_unique<State>(std::move(reading)));
}

std::vector<Address> ProjectText::differencesTo(ProjectText const& other) const {
    auto found = differences(state_->content(), other.state_->content(), mostDifferences);
    return found ? *std::move(found) : std::vector{Address::root()};
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

std::string const& ProjectText::body() const noexcept {
    return state_->body();
}

bool ProjectText::isTidy() const noexcept {
    return state_->reading().canonical && state_->reading().tail.empty();
}

bool ProjectText::hasTornTail() const noexcept {
    return state_->reading().torn;
}

std::vector<Fault> const& ProjectText::faults() const noexcept {
    return state_->reading().faults;
}

std::string ProjectText::damagedLines() const {
    std::string lines;
    for (auto const& [number, line] : state_->reading().damage) {
        lines += line;
    }
    return lines;
}

} // namespace project::stores

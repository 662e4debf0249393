// Random batches against a plain map: for every history, the content equals the map's, and the bytes after
// tidying depend on nothing else.
#include "text/ProjectText.hpp"

#include <rapidcheck/gtest.h>

#include "line/NodeLine.hpp"
#include "support/TextGenerators.hpp"
#include "text/TextLines.hpp"

namespace project::stores {

namespace {

using namespace samples;

/// The nodes by address, in the simplest form: a null node is an address that was created without one.
class Model {
public:
    void apply(Change const& change) {
        if (change.kind == Change::Kind::Remove) {
            std::erase_if(nodes_, [&](auto const& entry) { return entry.first.isWithin(change.address); });
        } else {
            nodes_[change.address] = change.node;
        }
    }

    bool exists(Address const& address) const {
        return std::any_of(nodes_.begin(), nodes_.end(),
                           [&](auto const& entry) { return entry.first.isWithin(address); });
    }

    Content content() const {
        Content content;
        for (auto const& [address, node] : nodes_) {
            content.emplace(address, described(node));
        }
        return content;
    }

    std::string text() const {
        std::string text = std::string(firstLine) + "\n";
        for (auto const& [address, node] : nodes_) {
            appendNodeLine(text, AddressText(address), node);
            text += '\n';
        }
        return text + std::string(endLine) + "\n";
    }

    /// An address that exists, is above one that exists, or is arbitrary.
    Address drawAddress() const {
        if (nodes_.empty() || *rc::gen::inRange(0, 3) == 0) {
            return *anyAddress();
        }
        auto const at = *rc::gen::inRange<std::size_t>(0, nodes_.size());
        Address address = std::next(nodes_.begin(), static_cast<std::ptrdiff_t>(at))->first;
        for (int up = *rc::gen::inRange(0, 3); up > 0 && address.depth() > 1; --up) {
            address = address.parent();
        }
        return address;
    }

    /// A batch as the tree passes it; it is then applied.
    Batch drawBatch() {
        Batch batch;
        for (int count = *rc::gen::inRange(1, 8); count > 0; --count) {
            Address const address = drawAddress();
            Change change = set(address);
            switch (*rc::gen::inRange(0, 6)) {
            case 0:
                change = remove(address);
                break;
            case 1:
                change = exists(address) ? set(address) : make(address);
                break;
            case 2:
                break;
            default:
                change.node = *anyNode();
            }
            apply(change);
            batch.push_back(std::move(change));
        }
        return batch;
    }

private:
    std::map<Address, Node> nodes_;
};

std::string bytesOf(ProjectText const& text, std::string const& tail) {
    return text.body() + tail;
}

std::vector<Address> differencesOf(Content const& left, Content const& right) {
    std::vector<Address> different;
    for (auto const& [address, node] : left) {
        auto const found = right.find(address);
        if (found == right.end() || found->second != node) {
            different.push_back(address);
        }
    }
    for (auto const& [address, node] : right) {
        if (!left.contains(address)) {
            different.push_back(address);
        }
    }
    std::sort(different.begin(), different.end());
    return different;
}

RC_GTEST_PROP(ProjectTextModel, rewritingGivesTheBytesOfTheContent, ()) {
    Model model;
    ProjectText text = ProjectText::empty();
    for (int batches = *rc::gen::inRange(1, 5); batches > 0; --batches) {
        text = text.rewrittenWith(model.drawBatch());
        RC_ASSERT(text.body() == model.text());
        RC_ASSERT(text.isTidy());
    }
    RC_ASSERT(contentOf(text) == model.content());
}

RC_GTEST_PROP(ProjectTextModel, aWrittenTextIsReadUnchanged, ()) {
    Model model;
    std::string const body = ProjectText::empty().rewrittenWith(model.drawBatch()).body();
    ProjectText const read = readWhole(body);
    RC_ASSERT(read.isTidy());
    RC_ASSERT(read.faults().empty());
    RC_ASSERT(contentOf(read) == model.content());
    RC_ASSERT(read.rewrittenWith({}).body() == body);
}

RC_GTEST_PROP(ProjectTextModel, aTailHasTheContentOfARewrite, ()) {
    Model model;
    ProjectText rewritten = ProjectText::empty().rewrittenWith(model.drawBatch());
    ProjectText extended = readWhole(rewritten.body());
    std::string tail;
    for (int batches = *rc::gen::inRange(1, 5); batches > 0; --batches) {
        Content const before = model.content();
        Batch const batch = model.drawBatch();
        rewritten = rewritten.rewrittenWith(batch);
        std::string const added = extended.tailFor(batch);
        auto const found = extended.extend(added);
        tail += added;
        ProjectText const read = readWhole(bytesOf(extended, tail));

        RC_ASSERT(found.has_value());
        RC_ASSERT(addressesOf(*found) == differencesOf(before, model.content()));
        RC_ASSERT(contentOf(extended) == model.content());
        RC_ASSERT(contentOf(read) == model.content());
        RC_ASSERT(read.faults().empty());
        RC_ASSERT(extended.rewrittenWith({}).body() == rewritten.body());
        RC_ASSERT(read.rewrittenWith({}).body() == rewritten.body());
    }
}

RC_GTEST_PROP(ProjectTextModel, aRewriteOverATailContainsBoth, ()) {
    Model model;
    ProjectText text = ProjectText::empty().rewrittenWith(model.drawBatch());
    Batch const appended = model.drawBatch();
    RC_ASSERT(text.extend(text.tailFor(appended)).has_value());
    text = text.rewrittenWith(model.drawBatch());
    RC_ASSERT(text.body() == model.text());
}

RC_GTEST_PROP(ProjectTextModel, differencesAreThoseOfTheContents, ()) {
    Model model;
    ProjectText left = ProjectText::empty().rewrittenWith(model.drawBatch());
    Model other = model;
    RC_ASSERT(left.extend(left.tailFor(model.drawBatch())).has_value());
    ProjectText right = ProjectText::empty().rewrittenWith({}).rewrittenWith(other.drawBatch());
    if (*rc::gen::arbitrary<bool>()) {
        right = readWhole(left.body());
        Model same = model;
        RC_ASSERT(right.extend(right.tailFor(same.drawBatch())).has_value());
    }
    std::vector<Address> const expected = differencesOf(contentOf(left), contentOf(right));
    RC_ASSERT(addressesOf(left.differencesTo(right)) == expected);
    RC_ASSERT(addressesOf(right.differencesTo(left)) == expected);
}

/// Shuffles, duplicates and drops some lines of a body, and inserts others.
std::string disordered(std::string const& body) {
    std::vector<std::string> lines;
    for (std::size_t at = firstLine.size() + 1; at < body.size();) {
        std::size_t const end = body.find('\n', at) + 1;
        lines.push_back(body.substr(at, end - at));
        at = end;
    }
    lines.pop_back();
    for (int changes = *rc::gen::inRange(0, 6); changes > 0 && !lines.empty(); --changes) {
        auto const from = *rc::gen::inRange<std::size_t>(0, lines.size());
        auto const to = *rc::gen::inRange<std::size_t>(0, lines.size());
        switch (*rc::gen::inRange(0, 4)) {
        case 0:
            std::swap(lines[from], lines[to]);
            break;
        case 1:
            lines.insert(lines.begin() + static_cast<std::ptrdiff_t>(to), std::string(lines[from]));
            break;
        case 2:
            lines[from].insert(lines[from].size() - 1, 1, ' ');
            break;
        default:
            lines.insert(lines.begin() + static_cast<std::ptrdiff_t>(to),
                         *rc::gen::element<std::string>("damaged\n", "\n", "<<<<<<< x\n", "=======\n",
                                                        "||||||| x\n", ">>>>>>> x\n", "\"a\"\n",
                                                        "{\"file\":\"a\",\"type\":\"\"}\n"));
        }
    }
    std::string text = std::string(firstLine) + "\n";
    for (std::string const& line : lines) {
        text += line;
    }
    return text + std::string(endLine) + "\n";
}

RC_GTEST_PROP(ProjectTextModel, aReadableTextHasTheSameContentAfterTidying, ()) {
    Model model;
    Batch const first = model.drawBatch();
    ProjectText const whole = ProjectText::empty().rewrittenWith(first);
    std::string const bytes =
        disordered(whole.body()) + (*rc::gen::arbitrary<bool>() ? whole.tailFor(model.drawBatch()) : "");
    auto const text = ProjectText::read(bytes, "f");
    if (!text) {
        return;
    }
    ProjectText const tidied = text->rewrittenWith({});
    RC_ASSERT(text->hasSameBytes(bytes));
    RC_ASSERT(contentOf(tidied) == contentOf(*text));
    RC_ASSERT(readWhole(tidied.body()).isTidy());
    RC_ASSERT(text->differencesTo(tidied).empty());
    RC_ASSERT(tidied.differencesTo(*text).empty());
    RC_ASSERT(text->isTidy() == (bytes == tidied.body()));
}

} // namespace

} // namespace project::stores

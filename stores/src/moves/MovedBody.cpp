#include "moves/MovedBody.hpp"

#include <map>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "line/AddressState.hpp"
#include "line/LineParser.hpp"
#include "line/NodeLine.hpp"
#include "node/NodeJoin.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::stores {

namespace {

namespace schema = metadata::schema;

AddressState joined(AddressState const& first, AddressState const& second) {
    if (!first.node || !second.node) {
        return first.node ? first : second;
    }
    NodeJoin join(*first.node);
    join.add(*second.node);
    return {std::move(join).take(), false};
}

/// Whether an address is that of a file or folder in the file list, or below one.
bool isInFileList(Address const& address) {
    return address.depth() > 1 && address[0].getType() == schema::files::filesType &&
           address[0].getLocation() == schema::files::fileListScope &&
           address[1].getType() == schema::files::fileType;
}

Address markerOf(Address const& folder) {
    return folder.child({schema::files::markerType, schema::files::markerLocation});
}

bool isMarker(Address const& address) {
    return isInFileList(address) && address.leaf().getType() == schema::files::markerType;
}

/// Moves the lines of a body.
class BodyMove {
public:
    BodyMove(TextBody const& body, PathMoves const& moves)
        : body_(body), moves_(moves), isTaken_(body.size(), false) {}

    /// @return nothing if no line of the body moves.
    std::optional<TextBody> run() {
        for (std::size_t line = 0; line < body_.size(); ++line) {
            takeIfMoved(line);
        }
        if (placed_.empty()) {
            return std::nullopt;
        }
        keepFoldersInUse();
        addFoldersAbove();
        joinWithLines();
        return written();
    }

private:
    void takeIfMoved(std::size_t line) {
        auto const text = body_.address(line);
        if (text.form == LineAddress::Form::Steps && !canRefer(text)) {
            return;
        }
        auto const address = toAddress(text);
        auto const to = moves_.moved(address);
        bool const isOfFile = text.form == LineAddress::Form::Names;
        if (!to && isOfFile) {
            return; // nearly all lines
        }
        auto state = stateOfLine(body_.line(line));
        auto node = moves_.moved(address, state.node);
        if (!to && node == state.node) {
            return;
        }
        isTaken_[line] = true;
        if (isMarker(address)) {
            leftFolders_.push_back(address.parent());
        }
        place(to.value_or(address), {std::move(node), state.isCreated});
    }

    /// Whether a line whose address is written as steps can name a file. Lines of categories cannot.
    static bool canRefer(LineAddress const& address) {
        LineSteps steps(address);
        return steps.next() && toElement(steps).getType() != schema::categories::categoriesType;
    }

    void place(Address const& address, AddressState const& state) {
        auto const [found, isNew] = placed_.try_emplace(address, state);
        if (!isNew) {
            found->second = joined(found->second, state);
        }
    }

    void placeFolder(Address const& folder) {
        place(folder, {plainNode(), false});
        place(markerOf(folder), {plainNode(), false});
    }

    void keepFoldersInUse() {
        for (auto const& folder : leftFolders_) {
            if (hasSomethingWithin(folder)) {
                placeFolder(folder);
            }
        }
    }

    bool hasSomethingWithin(Address const& folder) const {
        auto const placed = placed_.lower_bound(folder);
        if (placed != placed_.end() && placed->first.isWithin(folder)) {
            return true;
        }
        auto const lines = body_.within(AddressText(folder).view());
        for (auto line = lines.begin; line < lines.end; ++line) {
            if (!isTaken_[line]) {
                return true;
            }
        }
        return false;
    }

    void addFoldersAbove() {
        std::set<Address> seen;
        std::vector<Address> missing;
        for (auto const& [address, state] : placed_) {
            if (!isInFileList(address) || address.leaf().getType() != schema::files::fileType) {
                continue; // data of a file
            }
            for (auto folder = address.parent(); folder.depth() > 1 && seen.insert(folder).second;
                 folder = folder.parent()) {
                if (!exists(markerOf(folder))) {
                    missing.push_back(folder);
                }
            }
        }
        for (auto const& folder : missing) {
            placeFolder(folder);
        }
    }

    bool exists(Address const& address) const {
        auto const line = body_.find(AddressText(address).view());
        return (line && !isTaken_[*line]) || placed_.contains(address);
    }

    /// Lines that stay at an address that something moves to.
    void joinWithLines() {
        for (auto& [address, state] : placed_) {
            auto const line = body_.find(AddressText(address).view());
            if (line && !isTaken_[*line]) {
                isTaken_[*line] = true;
                state = joined(stateOfLine(body_.line(*line)), state);
            }
        }
    }

    TextBody written() {
        constexpr std::size_t expectedLine = 64;
        BodyWriter writer(body_, placed_.size() * expectedLine);
        TextBody::Range rest = body_.all();
        std::string line;
        for (auto const& [address, state] : placed_) {
            AddressText const text(address);
            auto const end = body_.lowerBound(rest, text.view());
            copyKept(writer, {rest.begin, end});
            rest.begin = end;
            line.clear();
            appendNodeLine(line, text, state.node);
            writer.add(line);
        }
        copyKept(writer, rest);
        return std::move(writer).finish();
    }

    void copyKept(BodyWriter& writer, TextBody::Range lines) const {
        while (!lines.empty()) {
            auto end = lines.begin;
            while (end < lines.end && !isTaken_[end]) {
                ++end;
            }
            writer.copy({lines.begin, end});
            lines.begin = end < lines.end ? end + 1 : end;
        }
    }

    TextBody const& body_;
    PathMoves const& moves_;
    std::vector<bool> isTaken_; ///< by line: it is not written as it is
    std::map<Address, AddressState> placed_;
    std::vector<Address> leftFolders_;
};

} // namespace

TextBody movedBody(TextBody body, PathMoves const& moves) {
    auto moved = moves.empty() ? std::nullopt : BodyMove(body, moves).run();
    return moved ? *std::move(moved) : std::move(body);
}

} // namespace project::stores

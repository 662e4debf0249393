#include "merge/FollowedRenames.hpp"

#include <algorithm>
#include <cstddef>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "moves/ConfirmedRenames.hpp"

namespace project::stores {

namespace {

using Paths = ConfirmedRenames::Paths;

std::u16string const& renamedIn(Paths const& renames, std::u16string const& path) {
    auto const found = renames.find(path);
    return found == renames.end() ? path : found->second;
}

/// One file or folder: its paths in the three versions, and after the merge.
struct Following {
    std::optional<std::u16string> base; ///< nothing for a file that is new
    std::optional<std::u16string> ours; ///< nothing where the side does not have it
    std::optional<std::u16string> theirs;
    std::u16string merged;
    bool isFolder;
};

/// Collects the files and folders to follow, without those that would meet at one path.
class Followings {
public:
    Followings(ThreeWay<TextBody> const& bodies, SideRenames const& ours, SideRenames const& theirs)
        : base_(bodies.base),
          ours_(bodies.ours),
          theirs_(bodies.theirs),
          ourRenames_(base_, ours_, ours.renamed),
          theirRenames_(base_, theirs_, theirs.renamed) {
        follow(ourRenames_.files(), theirRenames_.files(), ours.relocated, theirs.relocated, false);
        follow(ourRenames_.folders(), theirRenames_.folders(), {}, {}, true);
        followNew(ours_, ours.relocated, ourRenames_.files(), &Following::ours);
        followNew(theirs_, theirs.relocated, theirRenames_.files(), &Following::theirs);
        dropColliding();
    }

    ThreeWay<PathMoves> moves() const {
        return {movesOf(&Following::base), movesOf(&Following::ours), movesOf(&Following::theirs)};
    }

private:
    using Version = std::optional<std::u16string> Following::*;

    void follow(Paths const& ours, Paths const& theirs, Paths const& ourRelocated,
                Paths const& theirRelocated, bool isFolder) {
        std::set<std::u16string> renamed;
        for (auto const* renames : {&ours, &theirs}) {
            for (auto const& [from, to] : *renames) {
                renamed.insert(from);
            }
        }
        for (auto const& from : renamed) {
            auto const& our = renamedIn(ours, from);
            auto const& their = renamedIn(theirs, from);
            bool const isByOurs = our != from;
            bool const isByTheirs = their != from;
            bool const areDifferent = isByOurs && isByTheirs && our != their;
            bool const isListed = base_.has(from);
            bool const isGone = isListed && (!ours_.has(our) || !theirs_.has(their));
            if (!areDifferent && !isGone) {
                followings_.push_back({from, our, their,
                                       isByOurs && isByTheirs ? our
                                       : isByOurs             ? renamedIn(ourRelocated, our)
                                                              : renamedIn(theirRelocated, their),
                                       isFolder});
            }
        }
    }

    /// Files that a side added to a folder that the other one renamed.
    void followNew(FileList const& side, Paths const& relocated, Paths const& renames, Version version) {
        std::set<std::u16string> targets;
        for (auto const& [from, to] : renames) {
            targets.insert(to);
        }
        for (auto const& [from, to] : relocated) {
            if (side.has(from) && !base_.has(from) && !targets.contains(from)) {
                Following following{{}, {}, {}, to, false};
                following.*version = from;
                followings_.push_back(std::move(following));
            }
        }
    }

    /// Until nothing collides: leaving out one file can leave another one without its new place.
    void dropColliding() {
        bool hasDropped = true;
        while (hasDropped) {
            std::set<std::size_t> dropped;
            addColliding(base_, &Following::base, dropped);
            addColliding(ours_, &Following::ours, dropped);
            addColliding(theirs_, &Following::theirs, dropped);
            for (auto index = dropped.rbegin(); index != dropped.rend(); ++index) {
                followings_.erase(followings_.begin() + static_cast<std::ptrdiff_t>(*index));
            }
            hasDropped = !dropped.empty();
        }
    }

    void addColliding(FileList const& list, Version version, std::set<std::size_t>& dropped) const {
        std::map<std::u16string_view, std::size_t> byTarget;
        std::set<std::u16string_view> leaving;
        for (auto const& following : followings_) {
            if (following.*version && *(following.*version) != following.merged) {
                leaving.insert(*(following.*version));
            }
        }
        for (std::size_t i = 0; i < followings_.size(); ++i) {
            auto const& following = followings_[i];
            if (following.isFolder || !(following.*version)) {
                continue;
            }
            auto const [other, isFirst] = byTarget.try_emplace(following.merged, i);
            bool const isMoving = *(following.*version) != following.merged;
            bool const isTaken =
                isMoving && list.has(following.merged) && !leaving.contains(following.merged);
            if (!isFirst) {
                dropped.insert(other->second);
            }
            if (!isFirst || isTaken) {
                dropped.insert(i);
            }
        }
    }

    PathMoves movesOf(Version version) const {
        PathMoves result;
        for (auto const& following : followings_) {
            if (following.*version && *(following.*version) != following.merged) {
                result.add(*(following.*version), following.merged);
            }
        }
        return result;
    }

    FileList base_;
    FileList ours_;
    FileList theirs_;
    ConfirmedRenames ourRenames_;
    ConfirmedRenames theirRenames_;
    std::vector<Following> followings_;
};

} // namespace

ThreeWay<PathMoves> followedRenames(ThreeWay<TextBody> const& bodies, SideRenames const& ours,
                                    SideRenames const& theirs) {
    return Followings(bodies, ours, theirs).moves();
}

} // namespace project::stores

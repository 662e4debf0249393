// Random histories of two people who move files and folders, put labels on them, add files and set entry
// points. Each file has a label of its own, by which it is recognised wherever it is.
#include <algorithm>
#include <set>

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include "stores/merge/MergeSamples.hpp"

namespace project::stores {
namespace {

using namespace samples;

using Path = std::u16string;
using Labels = std::set<std::u16string>;

int drawNumber(int below) {
    return *rc::gen::resize(rc::kNominalSize, rc::gen::inRange(0, below));
}

Path folderOf(Path const& path) {
    auto const slash = path.rfind(u'/');
    return path.substr(0, slash == path.npos ? 0 : slash);
}

/// One version of a project: its files with their labels, the first of which is the file's own; and the files
/// of the entry points by UUID.
class Version {
public:
    std::map<Path, Labels> files;
    std::map<std::u16string, Path> entryPoints;

    std::set<Path> folders() const {
        std::set<Path> result;
        for (auto const& [path, labels] : files) {
            for (auto folder = folderOf(path); !folder.empty(); folder = folderOf(folder)) {
                result.insert(folder);
            }
        }
        return result;
    }

    std::string text() const {
        Batch batch;
        for (auto const& folder : folders()) {
            batch.push_back(set(fileAddress(folder)));
            batch.push_back(set(fileAddress(folder).child({u"DIR_SIGNIFIER", u"1"})));
        }
        for (auto const& [path, labels] : files) {
            Nested category{u"Category", {{u"UUID", u"c"}}, {}};
            for (auto const& label : labels) {
                category.nested.push_back({u"Label", {{u"UUID", label}}, {}});
            }
            batch.push_back(set(fileAddress(path), makeNode(u"Info", {}, {category})));
        }
        for (auto const& [uuid, path] : entryPoints) {
            batch.push_back(set(addressOf({u"EntryPoints", u"Root", u"EntryPoint", uuid.c_str()}),
                                makeNode(u"Info", {{u"File", path}})));
        }
        return textWith(batch);
    }
};

/// A person's work on a copy of the common version.
class Person {
public:
    Person(Version const& base, char16_t name) : version(base), base_(base), name_(name) {
        for (auto const& [path, labels] : base.files) {
            now_[path] = path;
        }
        for (int count = drawNumber(7); count > 0; --count) {
            act();
        }
    }

    /// The renames that source control knows, which need not be all.
    SideRenames renames(bool hasAll) const {
        SideRenames result;
        for (auto const& [from, to] : now_) {
            if (from != to && (hasAll || drawNumber(4) > 0) && !version.files.contains(from)) {
                result.renamed.emplace(from, to);
            }
        }
        return result;
    }

    /// The places of this person's files in folders that the other one has left altogether.
    SideRenames::Paths relocatedBy(Person const& other) const {
        SideRenames::Paths result;
        for (auto const& [path, labels] : version.files) {
            auto const to = other.newPlaceOf(folderOf(path));
            if (!base_.files.contains(path) && to) {
                auto target = *to + path.substr(folderOf(path).size());
                if (!other.version.files.contains(target) && !version.files.contains(target)) {
                    result.emplace(path, std::move(target));
                }
            }
        }
        return result;
    }

    Version version;
    bool hasMoved = false;
    bool hasLabelledOrEntered = false;

private:
    void act() {
        switch (drawNumber(6)) {
        case 0:
        case 1:
            moveFile();
            break;
        case 2:
            moveFolder();
            break;
        case 3:
            addFile();
            break;
        case 4:
            version.files.at(drawFile()).insert(name_ + drawName());
            hasLabelledOrEntered = true;
            break;
        default:
            version.entryPoints[name_ + drawName()] = drawFile();
            hasLabelledOrEntered = true;
        }
    }

    static std::u16string drawName() { return *rc::gen::element<std::u16string>(u"1", u"2", u"3"); }

    static Path drawFolder() {
        return *rc::gen::element<Path>(u"", u"src/", u"lib/", u"src/io/", u"lib/io/", u"old/");
    }

    Path drawFile() const {
        return std::next(version.files.begin(), drawNumber(static_cast<int>(version.files.size())))->first;
    }

    bool isFree(Path const& path) const {
        return !version.files.contains(path) && !version.folders().contains(path);
    }

    void addFile() {
        auto const path = drawFolder() + u"new" + drawName();
        if (isFree(path)) {
            version.files[path] = {std::u16string(u"id ") + name_ + path};
        }
    }

    void moveFile() {
        auto const from = drawFile();
        move(from, drawFolder() + *rc::gen::element<Path>(u"a", u"b", u"c", u"moved"));
    }

    void moveFolder() {
        auto const folders = version.folders();
        if (folders.empty()) {
            return;
        }
        auto const from = *std::next(folders.begin(), drawNumber(static_cast<int>(folders.size())));
        auto const to = *rc::gen::element<Path>(u"src", u"lib", u"other", u"other/io");
        if (to == from || (to + u'/').starts_with(from + u'/')) {
            return;
        }
        auto const files = version.files;
        for (auto const& [path, labels] : files) {
            if (path.starts_with(from + u'/')) {
                move(path, to + path.substr(from.size()));
            }
        }
    }

    void move(Path const& from, Path const& to) {
        if (!isFree(to) || base_.files.contains(to)) {
            return; // a path whose file has left is that of the same file, for source control and for the
                    // merge
        }
        hasMoved = true;
        auto labels = std::move(version.files.extract(from).mapped());
        version.files[to] = std::move(labels);
        for (auto& [path, now] : now_) {
            now = now == from ? to : now;
        }
        for (auto& [uuid, path] : version.entryPoints) {
            path = path == from ? to : path;
        }
    }

    /// Where this person has moved the files of a folder of the common version; nothing if some stayed or
    /// they went to several places.
    std::optional<Path> newPlaceOf(Path const& folder) const {
        std::set<Path> places;
        for (auto const& [from, to] : now_) {
            if (folderOf(from) == folder) {
                places.insert(folderOf(to));
            }
        }
        bool const isLeft = !folder.empty() && !version.folders().contains(folder);
        return isLeft && places.size() == 1 ? std::optional(*places.begin()) : std::nullopt;
    }

    Version const& base_;
    std::map<Path, Path> now_; ///< the paths of the files of the common version
    char16_t name_;
};

struct TwoPeople {
    TwoPeople() : ours(base(), u'o'), theirs(base(), u't') {}

    static Version const& base() {
        static Version const result = [] {
            Version version;
            for (Path const path : {u"a", u"src/a", u"src/b", u"src/io/c", u"old/d", u"old/e"}) {
                version.files[path] = {u"id " + path};
            }
            version.entryPoints = {{u"1", u"src/a"}, {u"2", u"old/d"}};
            return version;
        }();
        return result;
    }

    TextMerge merge() const {
        return mergeTexts(base().text(), ours.version.text(), theirs.version.text(), ourRenames,
                          theirRenames);
    }

    TextMerge exchanged() const {
        return mergeTexts(base().text(), theirs.version.text(), ours.version.text(), theirRenames,
                          ourRenames);
    }

    void learnRenames(bool hasAll) {
        ourRenames = ours.renames(hasAll);
        theirRenames = theirs.renames(hasAll);
        if (hasAll || drawNumber(2) == 0) {
            ourRenames.relocated = ours.relocatedBy(theirs);
            theirRenames.relocated = theirs.relocatedBy(ours);
        }
    }

    Person ours;
    Person theirs;
    SideRenames ourRenames;
    SideRenames theirRenames;
};

/// The labels of all files that have a file's own label.
class Found {
public:
    explicit Found(std::string const& text) {
        for (auto const& difference : ProjectText::empty().differencesTo(readWhole(text))) {
            add(difference);
        }
    }

    bool has(Labels const& labels) const {
        auto const own =
            std::ranges::find_if(labels, [](auto const& label) { return label.starts_with(u"id "); });
        auto const found = labels_.find(*own);
        return found != labels_.end() && std::ranges::includes(found->second, labels);
    }

    bool hasEntryPoint(std::u16string const& uuid) const { return entryPoints_.contains(uuid); }

    /// Whether each entry point starts a file of the list.
    bool isConsistent() const {
        return std::ranges::all_of(entryPoints_,
                                   [&](auto const& entry) { return paths_.contains(entry.second); });
    }

private:
    void add(Difference const& difference) {
        auto const& address = difference.address;
        if (address[0].getType() == u"EntryPoints") {
            entryPoints_[address.leaf().getLocation()] = difference.after->get(u"File");
            return;
        }
        Path path;
        for (std::size_t step = 1; step < address.depth(); ++step) {
            path += (path.empty() ? u"" : u"/") + address[step].getLocation();
        }
        paths_.insert(path);
        Labels labels;
        for (auto const& category : difference.after->getChildren()) {
            for (auto const& label : category->getChildren()) {
                labels.insert(label->get(u"UUID"));
            }
        }
        for (auto const& label : labels) {
            if (label.starts_with(u"id ")) {
                labels_[label].insert(labels.begin(), labels.end());
            }
        }
    }

    std::map<std::u16string, Labels> labels_;
    std::map<std::u16string, Path> entryPoints_;
    std::set<Path> paths_;
};

void requireNothingLost(TwoPeople const& people) {
    Found const found(people.merge().textWithMarkers());
    for (auto const* person : {&people.ours, &people.theirs}) {
        for (auto const& [path, labels] : person->version.files) {
            RC_ASSERT(found.has(labels));
        }
        for (auto const& [uuid, path] : person->version.entryPoints) {
            RC_ASSERT(found.hasEntryPoint(uuid));
        }
    }
}

RC_GTEST_PROP(TextMergeRenamesModel, loseNoFileNoLabelAndNoEntryPointOfEitherPerson, ()) {
    TwoPeople people;
    people.learnRenames(true);
    requireNothingLost(people);
}

RC_GTEST_PROP(TextMergeRenamesModel, loseNothingIfSourceControlKnowsSomeRenamesOnly, ()) {
    TwoPeople people;
    people.learnRenames(false);
    requireNothingLost(people);
}

RC_GTEST_PROP(TextMergeRenamesModel, giveTheSameTextWithTheSidesExchanged, ()) {
    TwoPeople people;
    people.learnRenames(drawNumber(2) == 0);
    auto const merge = people.merge();
    auto const exchanged = people.exchanged();
    RC_ASSERT(merge.conflicts().size() == exchanged.conflicts().size());
    if (merge.conflicts().empty()) {
        RC_ASSERT(merge.text() == exchanged.text());
    }
}

RC_GTEST_PROP(TextMergeRenamesModel, areCleanIfOnePersonMovesAndTheOtherDoesNot, ()) {
    TwoPeople people;
    RC_PRE(!people.theirs.hasMoved);
    people.learnRenames(true);
    for (auto const& [path, labels] : people.theirs.version.files) { // a folder may have left with its files
        RC_PRE(TwoPeople::base().files.contains(path));
    }
    auto const merge = people.merge();
    RC_ASSERT(merge.conflicts().empty());
    RC_ASSERT(Found(merge.text()).isConsistent());
}

} // namespace
} // namespace project::stores

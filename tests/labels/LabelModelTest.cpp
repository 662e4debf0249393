// Random sequences of operations on files, categories and labels, on the managers over a store and on a plain
// model. After each operation, all queries must have the same results in both.

#include <algorithm>
#include <functional>
#include <ostream>

#include <rapidcheck.h>

#include "entrypoints/EntryPointManagerBase.hpp"
#include "files/FileManagerBase.hpp"
#include "foundation/core/except/IMsgIDException.hpp"
#include "labels/LabelManagerBase.hpp"
#include "labels/LabelModel.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/MemoryBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::management {
namespace {

using test::LabelModel;
using test::line;
using test::Lines;
using test::lines;
using test::Refusal;

// Few values of each kind, so that operations meet. One UUID is that of a category and of a label.
std::vector<std::u16string> const categoryUUIDs{u"c1", u"c2", u"same"};
std::vector<std::u16string> const labelUUIDs{u"l1", u"l2", u"same"};
std::vector<std::u16string> const names{u"A", u"B", u"a", u""};
std::vector<std::u16string> const dataTypes{u"", u"String", u"unknown"};
std::vector<std::u16string> const projectFiles{u"a", u"a/b", u"a/b/c", u"a/d", u"e"};
std::vector<std::u16string> const allPaths{u"",    u"a", u"a/b", u"a/b/c", u"a/d", u"e", u".projectdata/f",
                                           u"gone"};

/// An operation of a sequence, with all the arguments that it may need.
struct Step {
    enum class Kind {
        add,
        remove,
        addLabels,
        removeLabels,
        removeCategory,
        createCategory,
        renameCategory,
        deleteCategory,
        createLabel,
        deleteLabel,
        putRecord,
        putValue
    };

    Kind kind;
    std::vector<std::u16string> paths; ///< relative to the root
    std::vector<Label> labels;         ///< at least one; the operation uses the category of the first one
    std::u16string name;

    CategoryIdentifier const& category() const { return labels[0].getCategory(); }

    LabelIdentifier const& label() const { return labels[0].getLabelIdentifier(); }
};

char const* nameOf(Step::Kind kind) {
    static char const* const kinds[] = {"add",
                                        "remove",
                                        "addLabels",
                                        "removeLabels",
                                        "removeCategory",
                                        "createCategory",
                                        "renameCategory",
                                        "deleteCategory",
                                        "createLabel",
                                        "deleteLabel",
                                        "putRecord",
                                        "putValue"};
    return kinds[static_cast<int>(kind)];
}

std::ostream& operator<<(std::ostream& out, Step const& step) {
    out << "\n" << nameOf(step.kind) << " name " << test::quoted(step.name) << " paths";
    for (auto const& path : step.paths) {
        out << " " << test::quoted(path);
    }
    for (auto const& label : step.labels) {
        out << "\n    " << line(label.getCategory()) << ": " << line(label.getLabelIdentifier());
    }
    return out;
}

/// Mostly paths that can be in the project: any other path makes the whole operation fail.
rc::Gen<std::u16string> anyPath() {
    return rc::gen::weightedOneOf<std::u16string>(
        {{15, rc::gen::elementOf(projectFiles)}, {1, rc::gen::elementOf(allPaths)}});
}

rc::Gen<Label> anyLabel() {
    return rc::gen::exec([] {
        auto const category =
            CategoryIdentifier(*rc::gen::elementOf(categoryUUIDs), *rc::gen::elementOf(names),
                               *rc::gen::weightedElement<bool>({{4, false}, {1, true}}),
                               *rc::gen::arbitrary<bool>(), *rc::gen::elementOf(dataTypes));
        auto const state = *rc::gen::element(LabelReadOnlyState::INHERITED, LabelReadOnlyState::WRITABLE,
                                             LabelReadOnlyState::READ_ONLY);
        return Label(category,
                     LabelIdentifier(*rc::gen::elementOf(labelUUIDs), *rc::gen::elementOf(names), state));
    });
}

rc::Gen<Step> anyStep() {
    using Kind = Step::Kind;
    return rc::gen::exec([] {
        // Additions are more frequent than removals, so that there is something to remove.
        auto const kind = *rc::gen::weightedElement<Kind>({{3, Kind::add},
                                                           {1, Kind::remove},
                                                           {8, Kind::addLabels},
                                                           {3, Kind::removeLabels},
                                                           {1, Kind::removeCategory},
                                                           {4, Kind::createCategory},
                                                           {1, Kind::renameCategory},
                                                           {1, Kind::deleteCategory},
                                                           {4, Kind::createLabel},
                                                           {1, Kind::deleteLabel},
                                                           {2, Kind::putRecord},
                                                           {2, Kind::putValue}});
        auto const pathCount = *rc::gen::inRange<std::size_t>(0, 4);
        auto const labelCount = *rc::gen::inRange<std::size_t>(1, 4);
        return Step{kind, *rc::gen::container<std::vector<std::u16string>>(pathCount, anyPath()),
                    *rc::gen::container<std::vector<Label>>(labelCount, anyLabel()),
                    *rc::gen::elementOf(names)};
    });
}

std::vector<Path> below(Path const& root, std::vector<std::u16string> const& relative) {
    std::vector<Path> result;
    for (auto const& path : relative) {
        result.push_back(root / path);
    }
    return result;
}

/// The managers of a project over a store in memory.
class RealProject {
public:
    explicit RealProject(Path const& projectRoot)
        : root(projectRoot),
          store(std::make_shared<stores::TreeMetadataManager>(std::make_unique<stores::MemoryBackend>(),
                                                              projectRoot / u".projectdata")) {
        files.setEntryPointManager(&entryPoints);
        files.setLabelManager(&labels);
    }

    void putRecord(Path const& path, std::u16string const& labelUUID, std::u16string const& value) {
        auto const address = at(path).child({u"LabelData", u"Data"});
        auto const before = store->getNode(address);
        auto const node = before ? std::make_shared<metadata::MetadataNodeSpecification>(*before)
                                 : std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
        auto* const record = node->addChild(u"Record");
        record->put(u"UUID", labelUUID);
        record->put(u"Value", value);
        write(address, node);
    }

    Lines records(Path const& path) {
        Lines result;
        if (auto const node = store->getNode(at(path).child({u"LabelData", u"Data"}))) {
            for (auto const& record : node->getChildren()) {
                result.push_back(test::quoted(record->get(u"UUID")) + " " +
                                 test::quoted(record->get(u"Value")));
            }
        }
        return result;
    }

    void putValue(Path const& path, std::u16string const& value) {
        std::shared_ptr<metadata::MetadataNode> const node = store->getNode(at(path));
        node->getChildren().at(0)->getChildren().at(0)->put(u"Value", value);
        write(at(path), node);
    }

    Path root;
    std::shared_ptr<stores::TreeMetadataManager> store;
    FileManagerBase files{root, store};
    LabelManagerBase labels{store, &files};
    EntryPointManagerBase entryPoints{store, &files, root};

private:
    metadata::MetadataPath at(Path const& path) const {
        return PathLocalizedFileMetadataManager(root, store, u"Root").toMetadataPath(path);
    }

    void write(metadata::MetadataPath const& address, std::shared_ptr<metadata::MetadataNode> node) {
        std::map<metadata::MetadataPath, std::shared_ptr<metadata::MetadataNode>> batch{
            {address, std::move(node)}};
        store->setNodes(batch);
    }
};

Refusal asRefusal(foundation::core::except::IMsgIDException const& error) {
    auto const& message = error.GetBaseMsgIDObj();
    Refusal refusal{message.getMessageName(), {}};
    for (auto const& argument : message.getArguments()) {
        refusal.arguments.push_back(std::get<std::u16string>(argument));
    }
    return refusal;
}

/// The result of a call, or its error.
Lines outcomeOf(std::function<Lines()> const& call) {
    try {
        return call();
    } catch (Refusal const& refusal) {
        return lines(refusal);
    } catch (foundation::core::except::IMsgIDException const& error) {
        return lines(asRefusal(error));
    }
}

/// Applies an operation to the managers or to the model, whose operations have the same names.
template <class Files, class Labels, class Others>
Lines apply(Step const& step, std::vector<Path> const& paths, Files& files, Labels& labels, Others& others) {
    using Kind = Step::Kind;
    switch (step.kind) {
    case Kind::add:
        files.add(paths);
        break;
    case Kind::remove:
        return lines(files.remove(paths));
    case Kind::addLabels:
        return lines(files.addLabels(paths, step.labels));
    case Kind::removeLabels:
        files.removeLabels(paths, step.labels);
        break;
    case Kind::removeCategory:
        files.removeCategory(paths, step.category());
        break;
    case Kind::createCategory:
        labels.createCategory(step.category());
        break;
    case Kind::renameCategory:
        labels.renameCategory(step.category(), step.name);
        break;
    case Kind::deleteCategory:
        labels.deleteCategory(step.category());
        break;
    case Kind::createLabel:
        labels.createLabel(step.category(), step.label());
        break;
    case Kind::deleteLabel:
        labels.deleteLabel(step.category(), step.label());
        break;
    case Kind::putRecord:
        for (auto const& path : paths) {
            files.getLabelIDSets(path); // throws for a file that is not in the project
            others.putRecord(path, step.label().getUUID(), step.name);
        }
        break;
    case Kind::putValue:
        for (auto const& path : paths) {
            if (!files.getLabelIDSets(path).empty()) {
                others.putValue(path, step.name);
            }
        }
        break;
    }
    return {};
}

void append(Lines& all, std::function<Lines()> const& call) {
    auto const more = outcomeOf(call);
    all.push_back("--");
    all.insert(all.end(), more.begin(), more.end());
}

/// The results of all queries.
template <class Files, class Labels, class Others>
Lines answers(Path const& root, Files& files, Labels& labels, Others& others) {
    Lines all = lines(files.getProjectFiles());
    for (auto const& relative : allPaths) {
        append(all, [&] { return lines(files.getLabelIDSets(root / relative)); });
        append(all, [&] { return lines(files.getLabels(root / relative)); });
        append(all, [&] { return others.records(root / relative); });
    }
    append(all, [&] { return lines(labels.getAllCategories()); });
    for (auto const& uuid : categoryUUIDs) {
        CategoryDefinition const category(u"any", uuid);
        append(all, [&] { return Lines{line(labels.getCategoryByUUID(uuid))}; });
        append(all, [&] { return lines(labels.getLabels(category)); });
        for (auto const& labelUUID : labelUUIDs) {
            append(all, [&] { return Lines{line(labels.getLabelByUUID(category, labelUUID))}; });
        }
    }
    return all;
}

/// The operations that add all files to the project and create all labels in all categories.
std::vector<Step> everythingDefined() {
    using Kind = Step::Kind;
    std::vector<Step> steps{{Kind::add, {u"a/b/c", u"a/d", u"e"}, {}, u""}};
    for (auto const& categoryUUID : categoryUUIDs) {
        auto const category = CategoryDefinition(categoryUUID, categoryUUID);
        for (auto const& labelUUID : labelUUIDs) {
            Label const label(category, LabelDefinition(labelUUID, labelUUID));
            if (&labelUUID == &labelUUIDs.front()) {
                steps.push_back({Kind::createCategory, {}, {label}, u""});
            }
            steps.push_back({Kind::createLabel, {}, {label}, u""});
        }
    }
    return steps;
}

/// The two projects that must be equal.
class Comparison {
public:
    explicit Comparison(Path const& root)
        : root_(root), real_(root), model_(root, root / u".projectdata", below(root, projectFiles)) {}

    void step(Step const& step) {
        auto const paths = below(root_, step.paths);
        auto const expected = outcomeOf([&] { return apply(step, paths, model_, model_, model_); });
        auto const actual = outcomeOf([&] { return apply(step, paths, real_.files, real_.labels, real_); });
        RC_ASSERT(actual == expected);
        RC_ASSERT(answers(root_, real_.files, real_.labels, real_) == answers(root_, model_, model_, model_));
    }

private:
    Path root_;
    RealProject real_;
    LabelModel model_;
};

/// Compares the projects after random operations, which follow some that are the same each time.
bool check(std::vector<Step> const& first) {
    test::TemporaryFolder const folder;
    for (auto const* file : {u"a/b/c", u"a/d", u"e"}) {
        folder.file(file);
    }
    return rc::check([&] {
        auto const steps = *rc::gen::container<std::vector<Step>>(anyStep());
        Comparison comparison(folder.root());
        for (auto const& step : first) {
            comparison.step(step);
        }
        for (auto const& step : steps) {
            comparison.step(step);
        }
    });
}

TEST(LabelModel, isMatchedFromAnEmptyProject) {
    EXPECT_TRUE(check({}));
}

TEST(LabelModel, isMatchedWhenMostLabelsOnFilesExist) {
    EXPECT_TRUE(check(everythingDefined()));
}

} // namespace
} // namespace project::management

#pragma once

#include <memory>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/session/Export.hpp"
#include "project/session/Move.hpp"

namespace project::session {

/// The personal layer of a project: categories and labels that belong to the person who works in this folder.
/// They are stored in a text of their own, `.projectdata/local/project.jsonl`, which source control ignores;
/// nothing of them is ever staged. A project that a server stores has its personal text in the folder, too.
///
/// Personal labels apply to the files of the project. They are removed when this layer's session removes the
/// file from the project. If the file leaves the project in any other way, for example because another branch
/// is checked out, its personal labels are hidden: they are there again when the file returns. removeHidden
/// deletes them.
///
/// A change is one step, as a change of the project is. It takes the store's read guard, so that a person who
/// may only read the project can still have labels, and then the write guard of the personal text. This order
/// never changes: nobody takes a guard of the project while holding one of the personal text alone.
///
/// In a transaction of the session, the personal changes belong to it. The project's text is committed first
/// and the personal text directly after it, so a crash between the two leaves the project's changes without
/// the personal ones. If only the personal text cannot be written, the project's changes remain, its
/// observers are called, and then the error is thrown.
///
/// Nothing is created on disk before the first change. Names are not compared with those of the project: the
/// same name may exist in both layers.
class PROJECT_SESSION_EXPORT Personal {
public:
    virtual ~Personal();

    /// The personal categories and their labels.
    virtual management::LabelManager& getLabelManager() noexcept = 0;

    /// The files of the project with their personal labels: the operations on labels concern the personal
    /// layer, and all others are those of the project. As in the project, the root has no labels.
    ///
    /// A file that has no personal label is left alone by removeLabels and removeCategory.
    virtual management::FileManager& getFileManager() noexcept = 0;

    /// The broadcaster for changes of the personal layer. It uses the events of categories and labels, and
    /// metadataChange for changes of the personal text that have no other event. Session::refresh and
    /// Session::watch report the changes of other programs on it.
    virtual std::shared_ptr<management::DispatchableProjectEventBroadcaster> const&
    events() const noexcept = 0;

    /// The files with personal labels that are not in the project now, in Path order. Takes both read locks.
    virtual std::vector<fl::filesystem::Path> hiddenFiles() = 0;

    /// Deletes the personal labels of files that are not in the project now.
    /// @return these files.
    virtual std::vector<fl::filesystem::Path> removeHidden() = 0;

    /// Lets hidden personal labels follow files that somebody else has moved, for example in a commit that
    /// was merged. A move is left out if its old path is not hidden, its new path is not in the project or
    /// has personal labels of its own, or another move leads there: its labels stay hidden.
    /// @return the moves that were followed.
    virtual std::vector<Move> followHidden(std::vector<Move> const& moves) = 0;

protected:
    Personal() = default;
    Personal(Personal const&) = default;
    Personal& operator=(Personal const&) = default;
};

} // namespace project::session

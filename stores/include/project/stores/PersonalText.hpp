#pragma once

#include <memory>

#include "project/stores/Disk.hpp"
#include "project/stores/TextBackend.hpp"

namespace project::stores {

/// The text of one person's own categories and labels: `.projectdata/local/project.jsonl`. It has the format
/// and the promises of a project's text, and source control ignores it: its folder has a `.gitignore` that
/// names everything, and the `.gitignore` of the folder above names this folder.
///
/// A project that a server stores has it beside the file with the location.
struct PROJECT_STORES_EXPORT PersonalText {
    /// The name of its folder in the store's folder, "local".
    static char16_t const* const folderName;

    /// The folder of the project with this root.
    static Path folder(Path const& projectRoot);

    /// The path of the text.
    static Path path(Path const& projectRoot);

    /// The backend of a project's personal text. Nothing is created before the first batch.
    static std::unique_ptr<TextBackend> open(Path const& projectRoot);
};

/// Adds the folder of the personal text to the `.gitignore` of the store's folder, unless a line names it
/// already. Everything else in the file stays as it is. Creates the file if there is none. Takes no lock: the
/// line is appended in one write, and only to the file that was read.
/// @param disk the store's folder.
/// @throws StoreError if the file cannot be read or written.
PROJECT_STORES_EXPORT void ignorePersonalText(Disk& disk);

} // namespace project::stores

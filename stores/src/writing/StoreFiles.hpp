#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "project/stores/Disk.hpp"

namespace project::stores {

/// The names of the files in the store's folder, and the content of the files that never change.
struct StoreFiles {
    static constexpr char const* text = "project.jsonl";

    /// The absolute path of the text, for errors.
    static std::string pathOfText(Disk const& disk) { return disk.folder() + "/" + text; }

    /// For source control: line ends stay as they are, and the text has a merge driver of its own.
    static constexpr char const* attributes = ".gitattributes";
    static constexpr std::string_view attributesContent = "project.jsonl -text merge=project-definition\n";

    /// For source control: temporary files and files that were set aside are not part of the project.
    static constexpr char const* ignored = ".gitignore";
    static constexpr std::string_view ignoredOfText = "/project.jsonl.*.tmp\n/damaged-*\n/displaced-*\n";

    /// The folder of a person's own text, in the folder of any store.
    static constexpr std::string_view ignoredPersonal = "/local/\n";

    /// The files of a new store: ignoredOfText and ignoredPersonal.
    static constexpr std::string_view ignoredContent =
        "/project.jsonl.*.tmp\n/damaged-*\n/displaced-*\n/local/\n";

    /// In the folder of a person's own text: everything, this file included.
    static constexpr std::string_view ignoredInPersonal = "*\n";

    /// A new name for a file that is being written: "project.jsonl.<process>-<random>.tmp".
    static std::string newTemporary();

    /// The name under which a complete new text is exchanged with the old one. It contains the states of
    /// both, so that after a crash a third file is not mistaken for either:
    /// "project.jsonl.<old>-<new>.swap.tmp".
    static std::string swapping(FileIdentity const& old, FileIdentity const& fresh);

    /// A new name for a file of another program that is set aside.
    static std::string newDisplaced();

    /// A new name for the damaged lines that a repair sets aside.
    static std::string newDamaged();

    static bool isTemporary(std::string_view name);
    static bool isDisplaced(std::string_view name);

    /// The states in the name of a swapping file.
    struct Swap {
        std::string oldState;
        std::string newState;

        bool isOld(FileIdentity const& file) const;
        bool isNew(FileIdentity const& file) const;

        /// True for the file of the old text, whatever its state.
        bool isOldFile(FileIdentity const& file) const;
    };

    /// Empty if the name is not that of a swapping file.
    static std::optional<Swap> parseSwapping(std::string_view name);
};

} // namespace project::stores

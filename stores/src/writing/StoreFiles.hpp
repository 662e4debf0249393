#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "project/stores/Disk.hpp"

namespace project::stores {

/// The names of the files in the store's folder, and the content of those that never change.
struct StoreFiles {
    static constexpr char const* text = "project.jsonl";

    /// For source control: line ends stay as they are, and the text has a merge driver of its own.
    static constexpr char const* attributes = ".gitattributes";
    static constexpr std::string_view attributesContent = "project.jsonl -text merge=project-definition\n";

    /// For source control: what is there only for a while, or was set aside, is not part of the project.
    static constexpr char const* ignored = ".gitignore";
    static constexpr std::string_view ignoredContent = "/project.jsonl.*.tmp\n/damaged-*\n/displaced-*\n";

    /// A fresh name for a file that is being written: "project.jsonl.<process>-<random>.tmp".
    static std::string newTemporary();

    /// The name under which a whole new text is put in the old one's place, which the old one then has. It
    /// tells the states of the two, so that after a crash nobody takes a third one for either:
    /// "project.jsonl.<old>-<new>.swap.tmp".
    static std::string swapping(FileIdentity const& old, FileIdentity const& fresh);

    /// A fresh name for something that is not the store's own and stood where it needed room.
    static std::string newDisplaced();

    /// A fresh name for damaged lines that a repair takes out of the text.
    static std::string newDamaged();

    static bool isTemporary(std::string_view name);
    static bool isDisplaced(std::string_view name);

    /// What the name of a swapping file tells.
    struct Swap {
        std::string oldState;
        std::string newState;

        bool isOld(FileIdentity const& file) const;
        bool isNew(FileIdentity const& file) const;

        /// The old text's file, whatever state it is in.
        bool isOldFile(FileIdentity const& file) const;
    };

    /// Empty when the name is no swapping file's.
    static std::optional<Swap> parseSwapping(std::string_view name);
};

} // namespace project::stores

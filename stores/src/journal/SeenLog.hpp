#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>

#include "project/stores/Change.hpp"
#include "project/stores/HistoryLoss.hpp"
#include "project/stores/Journal.hpp"
#include "project/stores/JournalCache.hpp"
#include "text/ProjectText.hpp"

namespace project::stores {

/// The first entry that cannot be applied.
struct DamagedEntry {
    std::uint64_t version;
    std::string problem; ///< a clause
};

/// The definition as it was read from a journal last, and the position of the entry that it ends with.
///
/// Every entry is verified: that it follows the entry before it, and its own checksum. A body that another
/// client wrote is computed from the text before it and fetched only if that gives another checksum. An entry
/// that cannot be applied is damage: the text stays at the entry before it, and later batches are not
/// applied, until a body follows that can be read.
class SeenLog {
public:
    explicit SeenLog(Journal& journal) : journal_(journal) {}

    /// Begins with a cached text, if it is sound and matches its position. @return false if not.
    bool begin(CachedText cached);

    /// The version to look from.
    std::optional<std::uint64_t> version() const;

    /// Applies the entries of a look from version(), and adds the differences to the changes. If it throws,
    /// the entries before the failure are applied.
    void follow(JournalLook look, Changes& changes);

    /// False until a text, perhaps an empty one, has been read.
    bool hasRead() const noexcept { return hasRead_; }

    ProjectText const& text() const noexcept { return text_; }

    /// The position of the text: that of the newest entry, or of the last one before the damage.
    JournalPosition const& position() const noexcept { return position_; }

    /// The newest entry, readable or not.
    JournalPosition const& newest() const noexcept { return newest_; }

    std::optional<DamagedEntry> const& damage() const noexcept { return damage_; }

    /// The loss of history that was found and not taken.
    std::optional<HistoryLoss> const& loss() const noexcept { return loss_; }

    std::optional<HistoryLoss> takeLoss() noexcept { return std::exchange(loss_, std::nullopt); }

    /// Reads the text from a body in the history, with all entries after it. @return false if the body is
    /// unreadable.
    bool readFrom(JournalPosition const& body, Changes& changes);

    /// This client has appended a batch, or a body.
    void appended(std::string_view lines, JournalPosition position);
    void replaced(ProjectText text, JournalPosition position);

private:
    /// A body, or the reason why it is unreadable.
    struct ReadBody {
        std::optional<ProjectText> text;
        std::string problem;
    };

    void readAll(JournalLook look, Changes& changes);
    void readAgain(HistoryLoss::Kind kind, Changes& changes);
    void readEarlier(JournalPosition const& damaged, Changes& changes);
    void apply(std::span<JournalEntry const> entries, Changes& changes);
    std::string applyBatch(JournalEntry const& entry, Changes& changes);
    std::string applyBody(JournalEntry const& entry, Changes& changes);
    bool computeBody(JournalEntry const& entry, Changes& changes);
    std::string problemOfChain(JournalEntry const& entry) const;
    ReadBody fetchBody(JournalPosition const& position);
    ReadBody readBody(std::string bytes, JournalPosition const& position) const;
    void replaceText(ProjectText text, JournalPosition const& position, Changes& changes);
    void noteLoss(HistoryLoss loss);

    Journal& journal_;
    ProjectText text_ = ProjectText::empty();
    JournalPosition position_;
    JournalPosition newest_;
    std::optional<DamagedEntry> damage_;
    std::optional<HistoryLoss> loss_;
    bool hasRead_ = false;
};

} // namespace project::stores

#pragma once

#include <memory>
#include <type_traits>
#include <vector>

#include "cmlink/CMAdapter.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::session {

using fl::filesystem::Path;

/// Keeps git's copy of the project's text in step: the layer below stages files that come and go, and the
/// text merely changes. A commit must not hold a file without its entry in the text.
class DefinitionStager {
public:
    /// @param store whose writes count. @param adapter borrowed, as the store is.
    /// @param text the file to stage.
    DefinitionStager(metadata::MetadataManager& store, cmlink::CMAdapter& adapter, Path text);

    /// Stages the text if the store was written since the last time, and source control tracks it. Takes the
    /// write lock, since an adapter is used by one thread at a time.
    void stageIfWritten();

    /// Stages those of some files whose removal is staged. They came back into the project; the layer below
    /// acts on what git does not know, and these it knows. Takes the write lock.
    void stageReturned(std::vector<Path> const& files);

    /// Counts as a write of the store.
    void noteWritten() noexcept;

    /// Whether the store was written and the text was not staged since.
    bool isDue() const noexcept;

    /// Does something to the project, and stages the text. @return what the operation gave.
    template <typename Operation>
    auto after(Operation const& operation) {
        if constexpr (std::is_void_v<decltype(operation())>) {
            operation();
            stageIfWritten();
        } else {
            auto result = operation();
            stageIfWritten();
            return result;
        }
    }

private:
    class WriteWatch;

    metadata::MetadataManager& store_;
    cmlink::CMAdapter& adapter_;
    Path text_;
    std::shared_ptr<WriteWatch> watch_; ///< the store holds it weakly
};

} // namespace project::session

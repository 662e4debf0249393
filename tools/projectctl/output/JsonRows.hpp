#pragma once

#include <optional>
#include <string_view>

#include "output/JsonDocument.hpp"

namespace projectctl {

/// Writes a JSON array of objects to standard output, one object per line.
///
/// Order of use: for each object begin, then its members; finish after the last one.
class JsonRows : public JsonObject {
public:
    /// An array that is part of a larger value. The caller writes its key.
    JsonRows() = default;

    /// The only array of a document. Nothing is written before the first object, so that an error before it
    /// leaves no half document.
    /// @param key of the array; must outlive this object.
    JsonRows(JsonFormat const& format, std::string_view key) : format_(&format), key_(key) {}

    void begin();

    /// Ends the array, and its document if it has one.
    void finish();

private:
    void open();

    JsonFormat const* format_ = nullptr;
    std::string_view key_;
    std::optional<JsonDocument> document_;
    bool isEmpty_ = true; ///< no object was written
};

} // namespace projectctl

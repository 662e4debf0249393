#pragma once

#include "output/JsonFormat.hpp"
#include "output/JsonObject.hpp"

namespace projectctl {

/// Writes a JSON document to standard output: an object whose first members are its format and version.
///
/// Order of use: the members, then finish.
class JsonDocument : public JsonObject {
public:
    explicit JsonDocument(JsonFormat const& format);

    /// Ends the document, with a line feed.
    void finish();
};

} // namespace projectctl

#pragma once

#include "output/JsonObject.hpp"

namespace projectctl {

/// Writes a JSON array of objects to standard output, one object per line.
///
/// Order of use: for each object begin, then its members; finish after the last one.
class JsonRows : public JsonObject {
public:
    void begin();

    /// Ends an array that is part of a larger value.
    void finish();

    /// Ends an array that is the whole output, with a line feed.
    void finishOutput();

private:
    bool isEmpty_ = true; ///< no object was written
};

} // namespace projectctl

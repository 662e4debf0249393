#pragma once

#include "output/JsonObject.hpp"

namespace projectctl {

/// A JSON array of objects on standard output, one a line.
///
/// The order of use: for each object begin, then its members; finish at the end.
class JsonRows : public JsonObject {
public:
    void begin();

    /// Ends the array, which is part of something.
    void finish();

    /// Ends the array and the line: the output is nothing but this array.
    void finishOutput();

private:
    bool isEmpty_ = true; ///< no object has begun
};

} // namespace projectctl

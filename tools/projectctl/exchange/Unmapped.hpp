#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include "output/Failure.hpp"
#include "output/JsonObject.hpp"

namespace projectctl {

/// The items of an import or export that have no counterpart on the other side.
class Unmapped {
public:
    /// @param source a name for the data, for the messages.
    explicit Unmapped(std::string source) : source_(std::move(source)) {}

    /// @param line of the source, from 1; 0 if it has none.
    void add(std::size_t line, Message const& reason);
    void add(std::size_t line, Failure const& reason);

    bool isEmpty() const noexcept { return items_.empty(); }

    /// Writes one line for each of them to standard error, in the order of their lines.
    /// @return the exit code of the command: `finding` if there are any.
    int report();

    /// Writes them as the member "unmapped" instead. @return as report.
    int addTo(JsonObject& object);

private:
    void sort();
    int exitCode() const noexcept;

    struct Item {
        std::size_t line;
        std::string reason;
    };

    std::string source_;
    std::vector<Item> items_;
};

} // namespace projectctl

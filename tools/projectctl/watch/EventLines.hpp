#pragma once

#include <string_view>
#include <vector>

#include "cli/ShownPaths.hpp"
#include "output/JsonObject.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// Writes each event of a project to standard output, from construction on: a line with the event's name and
/// data, separated by tabs, or a JSON object.
///
/// Names are quoted as appendQuoted does, so that a line is always one event. Must outlive the last event.
class EventLines {
public:
    EventLines(OpenProject& project, bool asJson);
    EventLines(EventLines const&) = delete;
    EventLines& operator=(EventLines const&) = delete;

    /// Writes the first line: from now on, every change is reported. It gives the version of the format.
    void writeReady() const;

private:
    using CategoryIdentifier = project::management::CategoryIdentifier;
    using Label = project::management::Label;

    void write(std::string_view event);
    void writeFiles(std::string_view event, std::vector<Path> const& files);
    void writeCategory(std::string_view event, CategoryIdentifier const& category);
    void writeLabel(Label const& label);

    ShownPaths shown_;
    bool asJson_;
};

} // namespace projectctl

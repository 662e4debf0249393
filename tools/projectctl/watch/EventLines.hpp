#pragma once

#include <memory>

#include "project/OpenProject.hpp"

namespace projectctl {

/// Writes each event of a project to standard output, from construction on: a line with the event's name and
/// data, separated by tabs, or a JSON object. An event of the personal layer has the word personal in front
/// of its name, or a member "personal".
///
/// Names are quoted as appendQuoted does, so that a line is always one event. Must outlive the last event.
class EventLines {
public:
    EventLines(OpenProject& project, bool asJson);
    ~EventLines();
    EventLines(EventLines const&) = delete;
    EventLines& operator=(EventLines const&) = delete;

    /// Writes the first line: from now on, every change is reported. It gives the version of the format.
    void writeReady() const;

private:
    class OfLayer;

    std::unique_ptr<OfLayer> project_;
    std::unique_ptr<OfLayer> personal_;
    bool asJson_;
};

} // namespace projectctl

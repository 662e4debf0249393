#include "files/MoveFailure.hpp"

#include <string>

namespace projectctl {

using Reason = project::session::MoveError::Reason;

namespace {

char const* messageFor(Reason reason) {
    switch (reason) {
    case Reason::IsRoot:
        return "MoveOfRoot";
    case Reason::IsMissing:
        return "MoveOfMissing";
    case Reason::IsNested:
        return "MoveIsNested";
    case Reason::Exists:
        return "MoveOntoExisting";
    case Reason::IsInProject:
        return "MoveOntoListed";
    case Reason::LeavesProject:
        return "MoveOutOfProject";
    case Reason::EntersStore:
        return "MoveIntoStore";
    case Reason::EntersItself:
        return "MoveIntoItself";
    case Reason::HasNoFolder:
        return "MoveWithoutFolder";
    case Reason::IsBeyondLink:
        return "MoveBeyondLink";
    case Reason::IsOtherFileSystem:
        return "MoveToOtherFileSystem";
    case Reason::DiskFailed:
        return "MoveFailed";
    }
    return "MoveFailed";
}

} // namespace

Failure failureOf(project::session::MoveError const& error) {
    auto const& move = error.move();
    return Failure(Message(messageFor(error.reason()), move.from, move.to, error.problem()));
}

} // namespace projectctl

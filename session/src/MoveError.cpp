#include <utility>

#include "fl/i18n/Utf8.hpp"
#include "project/session/Move.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::session {

namespace {

using Reason = MoveError::Reason;

/// The name of the text.
char const* textOf(Reason reason) {
    switch (reason) {
    case Reason::IsRoot:
        return "MoveOfRoot";
    case Reason::IsMissing:
        return "MoveOfMissing";
    case Reason::IsNested:
        return "MoveNested";
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
    return "";
}

} // namespace

MoveError::MoveError(Reason reason, Move move, std::string problem)
    : reason_(reason), move_(std::move(move)), problem_(std::move(problem)) {
    getStackTrace().capture(0);
    std::string const clause = errorTexts.get(textOf(reason_)) + (problem_.empty() ? "" : ": " + problem_);
    text_ = fl::i18n::toUtf8(move_.from.native()) + " -> " + fl::i18n::toUtf8(move_.to.native()) + ": " +
            clause + '.';
}

} // namespace project::session

#include <utility>

#include "fl/i18n/Utf8.hpp"
#include "project/session/Move.hpp"

namespace project::session {

namespace {

using Reason = MoveError::Reason;

char const* textOf(Reason reason) {
    switch (reason) {
    case Reason::IsRoot:
        return "the project's own folder cannot be moved";
    case Reason::IsMissing:
        return "the file is not on disk";
    case Reason::IsNested:
        return "the folder above it moves as well";
    case Reason::Exists:
        return "there is a file or folder already";
    case Reason::IsInProject:
        return "the path is in the project already";
    case Reason::LeavesProject:
        return "the path is outside the project's folder";
    case Reason::EntersStore:
        return "the path is in the folder of the project's definition";
    case Reason::EntersItself:
        return "a folder cannot be moved into itself";
    case Reason::HasNoFolder:
        return "there is no folder";
    case Reason::IsBeyondLink:
        return "there is a symbolic link above the path";
    case Reason::IsOtherFileSystem:
        return "the path is on another file system";
    case Reason::DiskFailed:
        return "the file cannot be moved";
    }
    return "";
}

} // namespace

MoveError::MoveError(Reason reason, Move move, std::string problem)
    : reason_(reason), move_(std::move(move)), problem_(std::move(problem)) {
    getStackTrace().capture(0);
    text_ = fl::i18n::toUtf8(move_.from.native()) + " -> " + fl::i18n::toUtf8(move_.to.native()) + ": " +
            textOf(reason_) + (problem_.empty() ? "" : ": " + problem_) + '.';
}

} // namespace project::session

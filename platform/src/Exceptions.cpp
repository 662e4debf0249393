#include <utility>

#include "computils/exception/StackTraceRecordingException.hpp"
#include "foundation/core/except/IMsgIDException.hpp"

namespace foundation::core::except {

// The destructors are defined here so that the type information of the interfaces exists in one library only.
IException::~IException() = default;
IUserException::~IUserException() = default;
IMsgIDException::~IMsgIDException() = default;

std::string IMsgIDException::get_error_id(resource_core::BaseMsgID const& message) {
    return message.getCatalogName() + ":" + message.getMessageName();
}

} // namespace foundation::core::except

namespace computils::exception {

StackTraceRecordingException::StackTraceRecordingException(std::u16string text) : text_(std::move(text)) {
}

StackTraceRecordingException::~StackTraceRecordingException() = default;

} // namespace computils::exception

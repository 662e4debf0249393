#include <exception>
#include <string>
#include <system_error>

#include "Bindings.hpp"
#include "fl/i18n/MessageCatalog.hpp"
#include "foundation/core/except/IMsgIDException.hpp"
#include "project/git/GitError.hpp"
#include "project/metadata/Messages.hpp"
#include "project/session/Move.hpp"
#include "project/stores/StoreError.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

/// Text in UTF-8, or a name on disk in other bytes.
py::str fromBytes(std::string const& text) {
    auto* const result =
        PyUnicode_DecodeUTF8(text.data(), static_cast<py::ssize_t>(text.size()), "surrogateescape");
    if (result == nullptr) {
        throw py::error_already_set();
    }
    return py::reinterpret_steal<py::str>(result);
}

py::object errorClass(char const* name) {
    return py::module_::import("project_management.errors").attr(name);
}

/// Lets Python raise an exception of the package. @param arguments of its class.
template <typename... Arguments>
void raise(char const* name, Arguments&&... arguments) {
    auto const type = errorClass(name);
    PyErr_SetObject(type.ptr(), type(std::forward<Arguments>(arguments)...).ptr());
}

/// A name on disk, as os.fsdecode returns it.
py::str fromNameBytes(std::string const& name) {
    auto* const result = PyUnicode_DecodeFSDefaultAndSize(name.data(), static_cast<py::ssize_t>(name.size()));
    if (result == nullptr) {
        throw py::error_already_set();
    }
    return py::reinterpret_steal<py::str>(result);
}

py::object argumentOf(resource_core::BaseMsgID::Argument const& argument, bool isPath) {
    if (auto const* const text = std::get_if<std::u16string>(&argument)) {
        return isPath ? fromPath(*text) : fromUtf16(*text);
    }
    if (auto const* const bytes = std::get_if<std::string>(&argument)) {
        return fromBytes(*bytes);
    }
    return py::int_(std::get<long>(argument));
}

py::object errorOf(resource_core::BaseMsgID const& message, std::u16string const& text) {
    auto const type = errorClass(message.getMessageName().c_str());
    bool const hasPaths = type.attr("has_paths").cast<bool>();
    py::list arguments;
    for (auto const& argument : message.getArguments()) {
        arguments.append(argumentOf(argument, hasPaths));
    }
    return type(fromUtf16(text), *arguments);
}

/// An error of the catalog: the class has the message's name, and the arguments are those of the message.
void raiseMessage(foundation::core::except::IMsgIDException const& error) {
    auto const raised = errorOf(error.GetBaseMsgIDObj(), error.GetUnicodeMessageTxt());
    PyErr_SetObject(py::type::handle_of(raised).ptr(), raised.ptr());
}

void raiseSystemError(std::system_error const& error, char const* file) {
    if (error.code() == std::errc::resource_deadlock_would_occur) {
        PyErr_SetString(PyExc_RuntimeError, "this thread reads a snapshot, and cannot change the project");
    } else {
        errno = error.code().value();
        PyErr_SetFromErrnoWithFilename(PyExc_OSError, file);
    }
}

// The errors of the library, and those of the standard library that pybind11 has no better class for.
void translate(std::exception_ptr thrown) {
    try {
        std::rethrow_exception(thrown);
    } catch (foundation::core::except::IMsgIDException const& error) {
        raiseMessage(error);
    } catch (stores::StoreError const& error) {
        raise("StoreError", fromBytes(error.what()), static_cast<int>(error.kind()),
              fromNameBytes(error.file()), error.line(), fromBytes(error.problem()),
              fromBytes(error.remedy()));
    } catch (git::GitError const& error) {
        raise("GitError", fromBytes(error.what()), static_cast<int>(error.kind()),
              fromNameBytes(error.file()), fromBytes(error.problem()), fromBytes(error.remedy()));
    } catch (session::MoveError const& error) {
        raise("MoveError", fromBytes(error.what()), static_cast<int>(error.reason()),
              fromPath(error.move().from.native()), fromPath(error.move().to.native()),
              fromBytes(error.problem()));
    } catch (ClosedError const&) {
        raise("ProjectClosed");
    } catch (std::filesystem::filesystem_error const& error) {
        raiseSystemError(error, error.path1().c_str());
    } catch (std::system_error const& error) {
        raiseSystemError(error, nullptr);
    }
}

} // namespace

void bindErrors(py::module_& module) {
    py::register_local_exception_translator(&translate);
    module.def(
        "set_language",
        [](std::string const& language) { fl::i18n::MessageCatalog::setGlobalLocale(language); },
        "Chooses the language of messages.");
    module.def(
        "file_not_in_project",
        [](Path const& path) {
            ZEPHRA::project::management::FileNotInProject const message(path.native());
            return errorOf(message, fl::i18n::MessageCatalog::get_message(message));
        },
        py::arg("path"), "The error for a file that is not in the project.");
    module.def("language", &fl::i18n::MessageCatalog::getGlobalLocale, "The language of messages.");
}

} // namespace project::python

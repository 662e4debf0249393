#include "Text.hpp"

#include <algorithm>
#include <cstddef>
#include <cstring>
#include <vector>

#include "fl/i18n/CodePoints.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

/// Whether Python's file names are UTF-8 with a surrogate for each other byte, which is the library's form.
bool isFileSystemUtf8() {
    static bool const result = [] {
        auto const sys = py::module_::import("sys");
        return sys.attr("getfilesystemencoding")().cast<std::string>() == "utf-8" &&
               sys.attr("getfilesystemencodeerrors")().cast<std::string>() == "surrogateescape";
    }();
    return result;
}

template <typename Unit>
bool hasSurrogateOrNul(Unit const* units, std::size_t size) {
    return std::any_of(units, units + size,
                       [](Unit unit) { return unit == 0 || fl::i18n::isSurrogate(unit); });
}

/// Whether the characters of a `str` are the path. Otherwise its bytes have to be asked for: two surrogates
/// can be the bytes of one character.
bool isPlainPath(py::handle text) {
    auto const size = static_cast<std::size_t>(PyUnicode_GET_LENGTH(text.ptr()));
    switch (PyUnicode_KIND(text.ptr())) {
    case PyUnicode_1BYTE_KIND:
        return std::memchr(PyUnicode_1BYTE_DATA(text.ptr()), 0, size) == nullptr;
    case PyUnicode_2BYTE_KIND:
        return !hasSurrogateOrNul(PyUnicode_2BYTE_DATA(text.ptr()), size);
    default:
        return !hasSurrogateOrNul(PyUnicode_4BYTE_DATA(text.ptr()), size);
    }
}

py::object owned(PyObject* object) {
    if (object == nullptr) {
        throw py::error_already_set();
    }
    return py::reinterpret_steal<py::object>(object);
}

fl::filesystem::Path pathOfBytes(py::handle bytes) {
    std::string name(PyBytes_AS_STRING(bytes.ptr()), static_cast<std::size_t>(PyBytes_GET_SIZE(bytes.ptr())));
    if (name.find('\0') != std::string::npos) {
        throw py::value_error("embedded null byte");
    }
    return fl::filesystem::fromSystem(std::filesystem::path(std::move(name)));
}

bool hasPair(std::u16string_view text) {
    for (std::size_t i = 1; i < text.size(); ++i) {
        if (fl::i18n::isLowSurrogate(text[i]) && fl::i18n::isHighSurrogate(text[i - 1])) {
            return true;
        }
    }
    return false;
}

std::vector<char32_t> codePoints(std::u16string_view text) {
    std::vector<char32_t> result;
    result.reserve(text.size());
    while (!text.empty()) {
        result.push_back(fl::i18n::takeCodePoint(text));
    }
    return result;
}

template <typename Unit>
py::str fromUnits(int kind, Unit const* units, std::size_t size) {
    return owned(PyUnicode_FromKindAndData(kind, units, static_cast<py::ssize_t>(size)));
}

} // namespace

std::u16string toUtf16(py::handle text) {
    if (PyUnicode_READY(text.ptr()) != 0) {
        throw py::error_already_set();
    }
    auto const size = static_cast<std::size_t>(PyUnicode_GET_LENGTH(text.ptr()));
    switch (PyUnicode_KIND(text.ptr())) {
    case PyUnicode_1BYTE_KIND: {
        auto const* const units = PyUnicode_1BYTE_DATA(text.ptr());
        return {units, units + size};
    }
    case PyUnicode_2BYTE_KIND: {
        auto const* const units = PyUnicode_2BYTE_DATA(text.ptr());
        return {units, units + size};
    }
    default: {
        auto const* const points = PyUnicode_4BYTE_DATA(text.ptr());
        std::u16string result;
        std::for_each(points, points + size,
                      [&result](Py_UCS4 point) { fl::i18n::appendUtf16(result, point); });
        return result;
    }
    }
}

py::str fromUtf16(std::u16string_view text) {
    if (hasPair(text)) {
        auto const points = codePoints(text);
        return fromUnits(PyUnicode_4BYTE_KIND, points.data(), points.size());
    }
    return fromUnits(PyUnicode_2BYTE_KIND, text.data(), text.size());
}

fl::filesystem::Path toPath(py::handle path) {
    py::object const name = owned(PyOS_FSPath(path.ptr()));
    if (PyBytes_Check(name.ptr())) {
        return pathOfBytes(name);
    }
    if (PyUnicode_READY(name.ptr()) != 0) {
        throw py::error_already_set();
    }
    if (isFileSystemUtf8() && isPlainPath(name)) {
        return toUtf16(name);
    }
    return pathOfBytes(owned(PyUnicode_EncodeFSDefault(name.ptr())));
}

py::str fromPath(std::u16string_view path) {
    if (isFileSystemUtf8()) {
        return fromUtf16(path);
    }
    auto const name = fl::filesystem::toSystem(std::u16string(path)).native();
    return owned(PyUnicode_DecodeFSDefaultAndSize(name.data(), static_cast<py::ssize_t>(name.size())));
}

} // namespace project::python

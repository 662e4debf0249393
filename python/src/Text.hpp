#pragma once

#include <string>
#include <string_view>

#include <pybind11/pybind11.h>

#include "fl/filesystem/Path.hpp"

namespace project::python {

/// The code units of a text. Surrogates are kept, also those without a partner. A `str` that contains the two
/// halves of a pair as two characters has the code units of the pair: the one text that does not survive.
/// @param text a `str`.
std::u16string toUtf16(pybind11::handle text);

/// The `str` of code units. A surrogate without its partner becomes a character of its own.
pybind11::str fromUtf16(std::u16string_view text);

/// The path of a `str`, `bytes` or os.PathLike, with the bytes that os.fsencode returns for it.
/// @throws pybind11::error_already_set as os.fsencode does, and ValueError for a NUL.
fl::filesystem::Path toPath(pybind11::handle path);

/// The path as os.fsdecode returns it for the bytes of the name on disk.
pybind11::str fromPath(std::u16string_view path);

} // namespace project::python

namespace pybind11::detail {

/// Every text of the library. pybind11's own conversion refuses surrogates without a partner.
template <>
struct type_caster<std::u16string> {
    PYBIND11_TYPE_CASTER(std::u16string, const_name("str"));

    bool load(handle source, bool /*converts*/) {
        if (!PyUnicode_Check(source.ptr())) {
            return false;
        }
        value = project::python::toUtf16(source);
        return true;
    }

    static handle cast(std::u16string const& text, return_value_policy /*policy*/, handle /*parent*/) {
        return project::python::fromUtf16(text).release();
    }
};

template <>
struct type_caster<fl::filesystem::Path> {
    PYBIND11_TYPE_CASTER(fl::filesystem::Path, const_name("str | bytes | os.PathLike"));

    bool load(handle source, bool /*converts*/) {
        value = project::python::toPath(source);
        return true;
    }

    static handle cast(fl::filesystem::Path const& path, return_value_policy /*policy*/, handle /*parent*/) {
        return project::python::fromPath(path.native()).release();
    }
};

} // namespace pybind11::detail

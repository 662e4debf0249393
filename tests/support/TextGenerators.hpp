#pragma once

#include <map>
#include <string>
#include <vector>

#include <rapidcheck.h>

#include "support/ProjectTextSamples.hpp"

namespace project::stores::samples {

/// Code units that are written in different ways or sort differently as bytes: letters, escaped characters,
/// both halves of surrogate pairs, and characters above and below them.
inline rc::Gen<char16_t> codeUnit() {
    return rc::gen::oneOf(
        rc::gen::element(u'a', u'b', u'/', u'.', u' ', u'"', u'\\', u'\n', u'\x01', u'\x7F'),
        rc::gen::element(u'\xD83D', u'\xDE00', u'\xDFFF', u'\xE000', u'\xFFFF', u'\u0416', u'\u05D0',
                         u'\u4E2D', u'\0'),
        rc::gen::arbitrary<char16_t>());
}

inline rc::Gen<std::u16string> anyText() {
    return rc::gen::scale(0.1, rc::gen::container<std::u16string>(codeUnit()));
}

/// A text that is often one of a few, so that addresses coincide.
inline rc::Gen<std::u16string> textNear(std::vector<std::u16string> const& usual) {
    return rc::gen::weightedOneOf<std::u16string>({{6, rc::gen::elementOf(usual)}, {1, anyText()}});
}

/// A few values of another generator. Their number does not grow with the size of the case.
template <typename T>
rc::Gen<std::vector<T>> fewOf(std::size_t most, rc::Gen<T> const& gen) {
    return rc::gen::mapcat(rc::gen::inRange<std::size_t>(0, most + 1), [gen](std::size_t count) {
        return rc::gen::container<std::vector<T>>(count, gen);
    });
}

inline rc::Gen<metadata::PathElement> anyStep() {
    return rc::gen::construct<metadata::PathElement>(
        textNear({u"File", u"DIR_SIGNIFIER", u"LabelData", u"Files"}),
        textNear({u"a", u"b", u"a b", u"a.c", u"1", u"Root", u""}));
}

inline rc::Gen<metadata::PathElement> anyName() {
    return rc::gen::construct<metadata::PathElement>(rc::gen::just(std::u16string(u"File")),
                                                     textNear({u"a", u"b", u"a b", u"a.c", u"c"}));
}

/// The steps after the names of a file: mostly none, else a marker, its data, or any steps.
inline rc::Gen<std::vector<metadata::PathElement>> anyEnd() {
    using Steps = std::vector<metadata::PathElement>;
    return rc::gen::weightedOneOf<Steps>({{6, rc::gen::just(Steps{})},
                                          {2, rc::gen::just(Steps{{u"DIR_SIGNIFIER", u"1"}})},
                                          {1, rc::gen::just(Steps{{u"LabelData", u"Data"}})},
                                          {1, fewOf(2, anyStep())}});
}

/// Addresses of files, of markers and data below them, and of anything else; never the root's.
inline rc::Gen<Address> anyAddress() {
    using Steps = std::vector<metadata::PathElement>;
    auto const file = rc::gen::apply(
        [](Steps const& names, Steps const& end) {
            Steps steps{{u"Files", u"Root"}};
            steps.insert(steps.end(), names.begin(), names.end());
            steps.insert(steps.end(), end.begin(), end.end());
            return Address(steps);
        },
        fewOf(3, anyName()), anyEnd());
    auto const other = rc::gen::apply(
        [](metadata::PathElement const& first, Steps const& rest) {
            Address address = Address::root().child(first);
            for (metadata::PathElement const& step : rest) {
                address = address.child(step);
            }
            return address;
        },
        anyStep(), fewOf(3, anyStep()));
    return rc::gen::weightedOneOf<Address>({{3, file}, {1, other}});
}

inline rc::Gen<Keys> anyKeys() {
    auto const key = rc::gen::pair(textNear({u"UUID", u"Name", u"Value"}), anyText());
    return rc::gen::map(fewOf(3, key), [](auto const& keys) { return Keys(keys.begin(), keys.end()); });
}

inline rc::Gen<std::vector<Nested>> anyNested(int levels) {
    if (levels == 0) {
        return rc::gen::just(std::vector<Nested>());
    }
    auto const one = rc::gen::apply(
        [](std::u16string const& type, Keys const& keys, std::vector<Nested> const& below) {
            return Nested{type, keys, below};
        },
        textNear({u"Category", u"Label", u""}), anyKeys(), anyNested(levels - 1));
    return fewOf(2, one);
}

/// Any node; half of them plain.
inline rc::Gen<Node> anyNode() {
    auto const filled =
        rc::gen::apply([](std::u16string const& type, Keys const& keys,
                          std::vector<Nested> const& nested) { return makeNode(type, keys, nested); },
                       textNear({u"Info", u""}), anyKeys(), anyNested(3));
    return rc::gen::oneOf(rc::gen::just(plainNode()), filled);
}

} // namespace project::stores::samples

namespace rc {

template <>
struct Arbitrary<project::stores::Address> {
    static Gen<project::stores::Address> arbitrary() { return project::stores::samples::anyAddress(); }
};

} // namespace rc

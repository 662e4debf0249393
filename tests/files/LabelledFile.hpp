#pragma once

#include "support/LabelledProject.hpp"

namespace project::test {

/// A project with a single-valued and a multi-valued category of two labels each, and one file without
/// labels.
class LabelledFile : public LabelledProject {
protected:
    LabelledFile() {
        define(color, {red, blue});
        define(tags, {urgent, later});
    }

    /// Sets the value of the first label of the first category on a file.
    void setLabelValue(Path const& path, std::u16string const& value) {
        auto const node = stored(at(path));
        node->getChildren()[0]->getChildren()[0]->put(u"Value", value);
        replace(at(path), node);
    }

    CategoryDefinition const color = CategoryDefinition(u"Color", u"c-color").setIsSingleValued(true);
    LabelDefinition const red{u"Red", u"l-red"};
    LabelDefinition const blue{u"Blue", u"l-blue"};
    CategoryDefinition const tags{u"Tags", u"c-tags"};
    LabelDefinition const urgent{u"Urgent", u"l-urgent"};
    LabelDefinition const later{u"Later", u"l-later"};
    Path const a = file(u"a");
};

} // namespace project::test

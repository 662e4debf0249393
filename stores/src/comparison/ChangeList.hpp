#pragma once

#include <map>
#include <string>
#include <utility>
#include <vector>

#include "project/stores/Change.hpp"
#include "project/stores/DefinitionChange.hpp"
#include "text/TextContent.hpp"

namespace project::stores {

/// Describes the differences between two versions, one after the other, in terms of the project.
class ChangeList {
public:
    /// @param before without the renames, which were applied to it already. @param before and after must
    /// outlive this object.
    ChangeList(TextContent const& before, TextContent const& after) : before_(before), after_(after) {}

    /// Differences must be added in the order of their addresses.
    void add(Difference const& difference);

    void add(DefinitionChange change) { changes_.push_back(std::move(change)); }

    /// All changes, by subject.
    std::vector<DefinitionChange> take() &&;

private:
    using Subject = DefinitionChange::Subject;
    using LabelValues = std::map<std::pair<std::u16string, std::u16string>, std::u16string>;

    void addSetting(Subject subject, Difference const& difference, char16_t const* key);
    void addInFiles(Difference const& difference);
    void addFile(Difference const& difference, std::u16string const& path);
    void addFileLabels(Difference const& difference, std::u16string const& path);
    void addFileData(Difference const& difference);
    void addNamed(Subject subject, Difference const& difference, char16_t const* nameKey);
    void addOther(Difference const& difference);
    bool isOfRemovedCategory(Address const& label) const;
    static LabelValues labelsOf(Node const& node);
    std::vector<DefinitionChange::Value> valuesOf(Difference const& difference, char16_t const* except) const;

    /// The name at an address in the later version, or else in the earlier one; or else its last location.
    std::u16string nameAt(Address const& address, char16_t const* key) const;

    TextContent const& before_;
    TextContent const& after_;
    std::vector<DefinitionChange> changes_;
};

} // namespace project::stores

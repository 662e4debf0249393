#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <vector>

#include "report/Definition.hpp"
#include "report/JsonWriter.hpp"

namespace projectctl {

/// Numbers the categories, labels and sets of labels of a report, so that each file has one number. Labels on
/// files that the definition does not have are numbered too.
class LabelTable {
public:
    using Categories = std::map<std::u16string, Definition::Category>;

    /// @param before categories that name labels which the definition does not have any more.
    LabelTable(Categories const& now, Categories const& before);

    /// The number of a set of labels. 0 is the empty set.
    std::size_t setOf(LabelsOnFile const& labels);

    /// Writes the members "categories", "labels" and "labelSets". Call it after the last call of setOf.
    void write(JsonWriter& json) const;

private:
    struct Named {
        std::u16string uuid;
        std::u16string name;
        bool isDeleted;
        std::size_t category = 0; ///< of a label
    };

    void addCategory(std::u16string const& uuid, Definition::Category const& category);
    std::size_t labelOf(LabelUUIDs const& uuids);
    std::size_t categoryOf(std::u16string const& uuid);
    std::u16string nameBefore(LabelUUIDs const& uuids) const;

    Categories const& before_;
    std::vector<Named> categories_;
    std::vector<Named> labels_;
    std::map<std::u16string, std::size_t> categoryNumbers_;
    std::map<LabelUUIDs, std::size_t> labelNumbers_;
    std::map<std::vector<std::size_t>, std::size_t> setNumbers_;
    std::vector<std::vector<std::size_t>> sets_;
};

} // namespace projectctl

#include "report/LabelTable.hpp"

#include <algorithm>
#include <utility>

namespace projectctl {

namespace {

/// The items of a map by their names, and by their keys if these are equal.
template <class Map, class NameOf>
auto byName(Map const& map, NameOf const& nameOf) {
    std::vector<typename Map::const_pointer> result;
    result.reserve(map.size());
    for (auto const& item : map) {
        result.push_back(&item);
    }
    std::ranges::stable_sort(result, {}, [&nameOf](auto const* item) { return nameOf(item->second); });
    return result;
}

} // namespace

LabelTable::LabelTable(Categories const& now, Categories const& before) : before_(before) {
    setOf({});
    for (auto const* category : byName(now, [](Definition::Category const& item) { return item.name; })) {
        addCategory(category->first, category->second);
    }
}

std::size_t LabelTable::setOf(LabelsOnFile const& labels) {
    std::vector<std::size_t> numbers;
    for (auto const& label : labels) {
        numbers.push_back(labelOf(label));
    }
    std::ranges::sort(numbers);
    auto const [found, isNew] = setNumbers_.try_emplace(numbers, sets_.size());
    if (isNew) {
        sets_.push_back(std::move(numbers));
    }
    return found->second;
}

void LabelTable::write(JsonWriter& json) const {
    json.objectsMember("categories", categories_, [&json](auto const& category) {
        json.member("uuid", category.uuid);
        json.member("name", category.name);
        json.flagMember("isDeleted", category.isDeleted);
    });
    json.objectsMember("labels", labels_, [&json](auto const& label) {
        json.numberMember("category", label.category);
        json.member("uuid", label.uuid);
        json.member("name", label.name);
        json.flagMember("isDeleted", label.isDeleted);
    });
    json.key("labelSets");
    json.beginArray();
    for (auto const& set : sets_) {
        json.beginArray();
        for (auto const label : set) {
            json.number(label);
        }
        json.endArray();
    }
    json.endArray();
}

void LabelTable::addCategory(std::u16string const& uuid, Definition::Category const& category) {
    std::size_t const number = categories_.size();
    categoryNumbers_[uuid] = number;
    categories_.push_back({uuid, category.name, false});
    for (auto const* label : byName(category.labels, [](std::u16string const& name) { return name; })) {
        labelNumbers_[{uuid, label->first}] = labels_.size();
        labels_.push_back({label->first, label->second, false, number});
    }
}

std::size_t LabelTable::labelOf(LabelUUIDs const& uuids) {
    auto const [found, isNew] = labelNumbers_.try_emplace(uuids, labels_.size());
    if (isNew) {
        labels_.push_back({uuids.second, nameBefore(uuids), true, categoryOf(uuids.first)});
    }
    return found->second;
}

std::size_t LabelTable::categoryOf(std::u16string const& uuid) {
    auto const [found, isNew] = categoryNumbers_.try_emplace(uuid, categories_.size());
    if (isNew) {
        auto const before = before_.find(uuid);
        categories_.push_back({uuid, before == before_.end() ? std::u16string() : before->second.name, true});
    }
    return found->second;
}

std::u16string LabelTable::nameBefore(LabelUUIDs const& uuids) const {
    auto const category = before_.find(uuids.first);
    if (category == before_.end()) {
        return {};
    }
    auto const label = category->second.labels.find(uuids.second);
    return label == category->second.labels.end() ? std::u16string() : label->second;
}

} // namespace projectctl

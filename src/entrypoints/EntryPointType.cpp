#include "project/entrypoints/EntryPointType.hpp"

#include <map>
#include <stdexcept>
#include <utility>

#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"

namespace project::management {

using ZEPHRA::project::management::EntryPointTypeUndefined;

namespace {

using NamesByType = std::map<EntryPointType, std::u16string>;
using TypesByName = std::map<std::u16string, EntryPointType>;

// The first pair of a type is the one that counts, so that "Batch_Job" is what is stored for batch jobs.
NamesByType namesByType = {
    {EntryPointType::Basic, u"Basic"},        {EntryPointType::Startup, u"Startup"},
    {EntryPointType::Shutdown, u"Shutdown"},  {EntryPointType::BatchJob, u"Batch_Job"},
    {EntryPointType::BatchJob, u"Batch Job"},
};

TypesByName invert(NamesByType const& names) {
    TypesByName result;
    for (auto const& [type, name] : names) {
        result.emplace(name, type);
    }
    return result;
}

TypesByName makeTypesByName() {
    auto result = invert(namesByType);
    // Stores hold these spellings too; they are read and never written.
    result[u"StartUp"] = EntryPointType::Startup;
    result[u"Batch Job"] = EntryPointType::BatchJob;
    return result;
}

TypesByName const typesByName = makeTypesByName();

} // namespace

std::u16string toString(EntryPointType type) {
    // A value without a name is given the empty one and never fails: who writes an entry point of a type that
    // is not known here must be able to write it, and only reading it again is an error.
    return namesByType[type];
}

EntryPointType getFromName(std::u16string name) {
    try {
        return typesByName.at(name);
    } catch (std::out_of_range const&) {
        exception::raise(EntryPointTypeUndefined(name));
    }
}

} // namespace project::management

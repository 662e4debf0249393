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

// The first pair of a type counts, so that "Batch_Job" is stored for batch jobs.
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
    TypesByName result = invert(namesByType);
    // Existing projects contain these spellings too. They are read and never written.
    result[u"StartUp"] = EntryPointType::Startup;
    result[u"Batch Job"] = EntryPointType::BatchJob;
    return result;
}

TypesByName const typesByName = makeTypesByName();

} // namespace

std::u16string toString(EntryPointType type) {
    // A value without a name gets the empty name and not an error: an entry point of an unknown type can be
    // written, and only reading it is an error.
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

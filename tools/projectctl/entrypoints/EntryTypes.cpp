#include "entrypoints/EntryTypes.hpp"

#include "project/entrypoints/EntryPointType.hpp"

namespace projectctl {

std::vector<std::u16string> entryTypeNames() {
    using project::management::EntryPointType;
    using project::management::toString;
    return {toString(EntryPointType::Basic), toString(EntryPointType::Startup),
            toString(EntryPointType::Shutdown), toString(EntryPointType::BatchJob)};
}

} // namespace projectctl

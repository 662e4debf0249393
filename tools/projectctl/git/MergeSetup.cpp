#include "git/MergeSetup.hpp"

#include <string>
#include <system_error>

#include "git/GitCommand.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

constexpr char const* driverKey = "merge.project-definition.driver";
constexpr char const* nameKey = "merge.project-definition.name";

void configure(Path const& folder, char const* key, char const* value) {
    auto const result = runGit(folder, {"config", key, value});
    if (result.exitCode != 0) {
        throw Failure("git cannot be told how to merge projects: " +
                      result.errors.substr(0, result.errors.find('\n')));
    }
}

} // namespace

MergeSetup lookForMergeSetup(Path const& folder) {
    try {
        if (runGit(folder, {"rev-parse", "--is-inside-work-tree"}).output != "true\n") {
            return MergeSetup::NoRepository;
        }
        return runGit(folder, {"config", "--get", driverKey}).exitCode == 0 ? MergeSetup::Done
                                                                            : MergeSetup::Missing;
    } catch (std::system_error const&) {
        return MergeSetup::NoRepository;
    }
}

void setUpMerge(Path const& folder) {
    configure(folder, nameKey, "projects, by what they say and not by lines");
    configure(folder, driverKey, "projectctl merge %O %A %B %P");
}

} // namespace projectctl

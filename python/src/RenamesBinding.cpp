#include <string>
#include <vector>

#include "Bindings.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using session::AmbiguousRename;
using session::Rename;
using session::RenameOptions;

py::tuple pathsOf(std::vector<std::u16string> const& paths) {
    py::tuple result(paths.size());
    for (std::size_t i = 0; i < paths.size(); ++i) {
        result[i] = fromPath(paths[i]);
    }
    return result;
}

/// ([(from, to, kind, evidence, similarity)], [(from, to)]), where the latter are ambiguous and have tuples
/// of paths.
py::tuple findRenames(OpenProject const& project, int similarity, bool usesGit) {
    RenameOptions const options{.similarity = similarity, .usesGit = usesGit};
    auto const found = project.run([&](Session& session) { return session.findRenames(options); });
    py::list pairs;
    for (Rename const& each : found.pairs) {
        pairs.append(py::make_tuple(fromPath(each.from), fromPath(each.to), static_cast<int>(each.kind),
                                    static_cast<int>(each.evidence), each.similarity));
    }
    py::list ambiguous;
    for (AmbiguousRename const& each : found.ambiguous) {
        ambiguous.append(py::make_tuple(pathsOf(each.from), pathsOf(each.to)));
    }
    return py::make_tuple(pairs, ambiguous);
}

} // namespace

void bindRenames(ProjectClass& project) {
    project.def("find_renames", &findRenames, py::arg("similarity"), py::arg("uses_git"));
}

} // namespace project::python

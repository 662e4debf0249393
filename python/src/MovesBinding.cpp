#include <optional>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/session/Move.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using session::Move;

py::list move(OpenProject const& project, py::iterable const& sources, py::handle destination) {
    auto const files = project.absolutes(sources);
    auto const target = project.absolute(destination);
    return project.relatives(project.run([&](Session& session) { return session.move(files, target); }));
}

/// Old and new paths, as a caller gave them.
using Pairs = std::vector<std::pair<py::object, py::object>>;

std::vector<Move> movesOf(OpenProject const& project, Pairs const& pairs) {
    std::vector<Move> moves;
    moves.reserve(pairs.size());
    for (auto const& [from, to] : pairs) {
        moves.push_back({project.absolute(from), project.absolute(to)});
    }
    return moves;
}

void adopt(OpenProject const& project, Pairs const& pairs) {
    auto const moves = movesOf(project, pairs);
    project.run([&](Session& session) { session.adopt(moves); });
}

py::list followHidden(OpenProject const& project, Pairs const& pairs) {
    auto const moves = movesOf(project, pairs);
    return project.relatives(
        project.run([&](Session& session) { return session.personal().followHidden(moves); }));
}

py::object takeRecovered(OpenProject const& project) {
    auto const recovered = project.run([](Session& session) { return session.takeRecoveredMoves(); });
    if (!recovered) {
        return py::none();
    }
    return py::make_tuple(static_cast<int>(recovered->outcome), project.relatives(recovered->moves),
                          project.relatives(recovered->left));
}

} // namespace

void bindMoves(ProjectClass& project) {
    project.def("move", &move, py::arg("sources"), py::arg("destination"));
    project.def("adopt", &adopt, py::arg("moves"));
    project.def("follow_hidden", &followHidden, py::arg("moves"));
    project.def("take_recovered_moves", &takeRecovered);
    project.def("has_unfinished_move", [](OpenProject const& open) {
        return open.run([](Session& session) { return session.hasUnfinishedMove(); });
    });
}

} // namespace project::python

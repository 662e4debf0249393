// Adds, lists and finds the files of a folder as files.py does, and prints the seconds of each.
//   files FOLDER      the folder has no project; a list of paths relative to it is read from standard input

#include <chrono>
#include <functional>
#include <iostream>
#include <string>
#include <vector>

#include <project/session.hpp>

using namespace project::management;

namespace {

void measure(char const* name, std::function<std::size_t()> const& work) {
    auto const begin = std::chrono::steady_clock::now();
    std::size_t const count = work();
    std::chrono::duration<double> const time = std::chrono::steady_clock::now() - begin;
    std::cout << name << ' ' << time.count() << ' ' << count << '\n';
}

} // namespace

int main(int argc, char** argv) {
    if (argc < 2) {
        return 2;
    }
    auto session = project::session::Session::create(fl::filesystem::fromSystem(argv[1]), u"Benchmark",
                                                     {.sourceControl = project::session::SourceControl::Off});
    auto& files = session.project().getFileManager();
    std::vector<fl::filesystem::Path> paths;
    for (std::string line; std::getline(std::cin, line);) {
        paths.push_back(session.root() / fl::filesystem::fromSystem(line));
    }
    measure("add", [&] {
        files.add(paths);
        return paths.size();
    });
    CategoryDefinition const status(u"Status");
    LabelDefinition const reviewed(u"Reviewed");
    session.project().getLabelManager().createCategory(status);
    session.project().getLabelManager().createLabel(status, reviewed);
    std::vector<fl::filesystem::Path> labelled;
    for (std::size_t i = 0; i < paths.size(); i += 10) {
        labelled.push_back(paths[i]);
    }
    files.addLabels(labelled, {Label(status, reviewed)});
    measure("list", [&] { return session.find({}).size(); });
    measure("find-glob", [&] { return session.find({.glob = u"**/*.cpp"}).size(); });
    measure("find-label", [&] {
        return session.find({.labels = {{status.getUUID(), reviewed.getUUID()}}}).size();
    });
}

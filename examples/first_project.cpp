// Creates a project in a folder, observes its events, labels a file and lists the entry points.
#include <fstream>
#include <iostream>

#include <project/session.hpp>

using namespace project::management;

int main(int argc, char** argv) {
    auto const folder = fl::filesystem::fromSystem(argc > 1 ? argv[1] : ".");
    auto session = project::session::Session::openOrCreate(folder, u"First project");
    session.events()->onFileListUpdate([](auto const&) { std::cout << "files changed\n"; });
    session.events()->onFileLabelsChanged([](auto const&) { std::cout << "labels changed\n"; });

    auto& project = session.project();
    auto const file = session.root() / u"main.cpp";
    std::ofstream(fl::filesystem::toSystem(file)) << "int main() {}\n";
    project.getFileManager().add({file});
    Label const done(CategoryDefinition(u"Status"), LabelDefinition(u"Done"));
    project.getLabelManager().createCategory(done.getCategory());
    project.getLabelManager().createLabel(done.getCategory(), done.getLabelIdentifier());
    project.getFileManager().addLabels({file}, {done});
    EntryPointDefinition start(file);
    project.getEntryPointManager().setEntryPoint(start.setType(EntryPointType::Startup));
    for (auto const& entry : project.getEntryPointManager().getEntryPoints()) {
        std::cout << "starts with " << fl::filesystem::toSystem(entry->getFile()).filename() << '\n';
    }
}

// A panel with the files of a project and their labels, in a terminal. It follows changes of other programs.
#include <clocale>
#include <exception>
#include <iostream>
#include <span>

#include <project/session.hpp>

#include "Panel.hpp"
#include "Terminal.hpp"

namespace {

void show(char const* folder) {
    auto session = project::session::Session::open(fl::filesystem::fromSystem(folder));
    session.refresh(); // changes are reported from here on
    project_panel::Terminal terminal;
    project_panel::Panel(session, terminal).run();
}

} // namespace

int main(int argc, char** argv) {
    std::span const arguments(argv, static_cast<std::size_t>(argc));
    if (arguments.size() != 2) {
        std::cerr << "usage: project_panel FOLDER\n";
        return 2;
    }
    std::setlocale(LC_CTYPE, ""); // decides which characters the terminal can show
    try {
        show(arguments[1]);
        return 0;
    } catch (std::exception const& error) {
        std::cerr << "project_panel: " << error.what() << '\n';
        return 1;
    }
}

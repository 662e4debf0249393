#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include <boost/signals2/connection.hpp>
#include <project/session.hpp>

#include "FileTree.hpp"
#include "Terminal.hpp"

namespace project_panel {

/// Shows the tree of a project on a terminal, and follows the changes that other programs make.
class Panel {
public:
    Panel(project::session::Session& session, Terminal& terminal);

    /// Returns when the user quits.
    void run();

private:
    void connect();
    void apply(Key key);
    void update();
    void followChanges();
    void moveTo(std::size_t row);
    void draw();
    void show(std::string const& picture);
    std::string line(std::size_t row, int columns) const;
    std::string lastLine(std::u16string const& text) const;

    project::session::Session& session_;
    Terminal& terminal_;
    FileTree tree_;
    std::vector<boost::signals2::scoped_connection> connections_;
    std::string shown_;        ///< the picture on the screen
    std::size_t selected_ = 0; ///< a row
    std::size_t first_ = 0;    ///< the row at the top of the screen
    bool isOutdated_ = false;  ///< there were changes since the tree was read
};

} // namespace project_panel

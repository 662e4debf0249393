#include "Panel.hpp"

#include <algorithm>
#include <chrono>

#include <fl/i18n/Utf8.hpp>
#include <project/stores/StoreError.hpp>

namespace project_panel {

using namespace std::chrono_literals;
using project::session::Session;

namespace {

/// The time between two checks for changes. The check of a text costs one system call, and that of a shared
/// project a round trip to its server.
std::chrono::milliseconds intervalOf(Session const& session) {
    return session.isShared() ? 2000ms : 200ms;
}

} // namespace

Panel::Panel(Session& session, Terminal& terminal) : session_(session), terminal_(terminal), tree_(session) {
    connect();
}

void Panel::connect() {
    auto const outdate = [this](auto const&...) { isOutdated_ = true; };
    auto& events = *session_.events();
    connections_.emplace_back(events.onFileListUpdate(outdate));
    connections_.emplace_back(events.onFileLabelsChanged(outdate));
    connections_.emplace_back(events.onLabelModified(outdate));
    connections_.emplace_back(events.onCategoryAdded(outdate));
    connections_.emplace_back(events.onCategoryRenamed(outdate));
    connections_.emplace_back(events.onCategoryDeleted(outdate));
}

void Panel::run() {
    for (Key key = Key::None; key != Key::Quit; key = terminal_.awaitKey(intervalOf(session_))) {
        apply(key);
        update();
    }
}

/// Draws the project as it is now. A failure is shown and not final: the text of a project can be incomplete
/// for a moment, and a server unreachable.
void Panel::update() {
    try {
        followChanges();
        draw();
    } catch (project::stores::StoreError const& error) {
        show(lastLine(fl::i18n::fromUtf8(error.what())));
    }
}

/// Reads the project again if another program has changed it.
void Panel::followChanges() {
    session_.refresh();
    if (isOutdated_) {
        tree_.read();
        isOutdated_ = false;
        moveTo(selected_); // the list may be shorter than before
    }
}

void Panel::apply(Key key) {
    if (tree_.rows().empty()) {
        return;
    }
    Row const row = tree_.rows()[selected_];
    switch (key) {
    case Key::Up:
        moveTo(selected_ == 0 ? 0 : selected_ - 1);
        break;
    case Key::Down:
        moveTo(selected_ + 1);
        break;
    case Key::Enter:
        tree_.setFolded(row, !tree_.isFolded(row));
        break;
    case Key::Left:
        tree_.setFolded(row, true);
        break;
    case Key::Right:
        tree_.setFolded(row, false);
        break;
    case Key::None:
    case Key::Quit:
        break;
    }
}

void Panel::moveTo(std::size_t row) {
    auto const count = tree_.rows().size();
    selected_ = count == 0 ? 0 : std::min(row, count - 1);
}

/// Draws the whole screen: a line for each row that fits above the last line, and that line.
void Panel::draw() {
    auto const size = terminal_.size();
    auto const height = static_cast<std::size_t>(std::max(size.rows - 1, 1));
    first_ = std::min(first_, selected_);
    if (selected_ >= first_ + height) {
        first_ = selected_ - height + 1;
    }
    auto const guard = session_.store().acquireReadLock(); // the picture shows one state of the project
    std::string picture = "\x1b[H";
    auto const end = std::min(first_ + height, tree_.rows().size());
    for (auto row = first_; row < end; ++row) {
        picture += (row == selected_ ? "\x1b[7m" : "") + line(row, size.columns) + "\x1b[0m\x1b[K\n";
    }
    show(picture + "\x1b[J" + lastLine(session_.project().getName() + u" - arrows, Enter: fold, q: quit"));
}

/// Writes what is to be drawn, unless it is on the screen already.
void Panel::show(std::string const& picture) {
    if (picture != shown_) {
        terminal_.write(picture);
        shown_ = picture;
    }
}

std::string Panel::line(std::size_t row, int columns) const {
    Row const& file = tree_.rows()[row];
    std::u16string text(2 * file.depth, u' ');
    text += !file.isFolder ? u"  " : tree_.isFolded(file) ? u"+ " : u"- ";
    text += file.name;
    for (auto const& label : tree_.labelsOf(file)) {
        text += u"  [" + label + u"]";
    }
    return printable(text, columns);
}

std::string Panel::lastLine(std::u16string const& text) const {
    auto const size = terminal_.size();
    return "\x1b[" + std::to_string(size.rows) + ";1H" + printable(text, size.columns) + "\x1b[K";
}

} // namespace project_panel

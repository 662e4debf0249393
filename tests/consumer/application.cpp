// What an application does with the installed session: a project in a folder of its own, opened a second
// time.
#include <cstdlib>
#include <filesystem>
#include <string>

#include <project/session.hpp> // also declares the errors of a session

int main() {
    auto pattern = (std::filesystem::temp_directory_path() / "project-consumer-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        return 1;
    }
    auto const folder = fl::filesystem::fromSystem(pattern);
    try {
        project::session::Session::create(folder, u"consumer");
        bool const isThere = project::session::Session::open(folder).project().getName() == u"consumer";
        std::filesystem::remove_all(pattern);
        return isThere ? 0 : 1;
    } catch (project::git::GitError const&) {
        return 2;
    } catch (project::session::MoveError const&) {
        return 3;
    } catch (project::stores::StoreError const&) {
        return 4;
    }
}

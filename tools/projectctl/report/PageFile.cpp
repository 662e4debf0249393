#include "report/PageFile.hpp"

#include <cerrno>
#include <cstdio>
#include <string>
#include <system_error>

#include <fcntl.h>
#include <unistd.h>

#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

namespace {

/// @throws std::system_error with the error of the last system call if the condition is false.
void require(bool condition) {
    if (!condition) {
        throw std::system_error(errno, std::generic_category());
    }
}

/// A new file beside another one. It is deleted unless it is renamed.
class TemporaryFile {
public:
    explicit TemporaryFile(std::string const& beside)
        : name_(beside + '.' + std::to_string(getpid()) + ".new"),
          descriptor_(::open(name_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666)) {
        require(descriptor_ >= 0);
    }

    TemporaryFile(TemporaryFile const&) = delete;
    TemporaryFile& operator=(TemporaryFile const&) = delete;

    ~TemporaryFile() {
        if (descriptor_ >= 0) {
            close(descriptor_);
        }
        if (!name_.empty()) {
            unlink(name_.c_str());
        }
    }

    void write(std::string_view content) const {
        while (!content.empty()) {
            auto const written = ::write(descriptor_, content.data(), content.size());
            require(written >= 0 || errno == EINTR);
            content.remove_prefix(written > 0 ? static_cast<std::size_t>(written) : 0);
        }
    }

    void renameTo(std::string const& name) {
        int const descriptor = descriptor_;
        descriptor_ = -1;
        require(close(descriptor) == 0);
        require(std::rename(name_.c_str(), name.c_str()) == 0);
        name_.clear();
    }

private:
    std::string name_; ///< empty once it is renamed
    int descriptor_;
};

} // namespace

void replaceFile(fl::filesystem::Path const& file, std::string_view content) {
    std::string const name = fl::filesystem::toSystem(file).string();
    try {
        TemporaryFile temporary(name);
        temporary.write(content);
        temporary.renameTo(name);
    } catch (std::system_error const& error) {
        throw Failure(Message("ReportNotWritten", file, error.code().message()));
    }
}

} // namespace projectctl

#include "KilledWriters.hpp"

#include <charconv>
#include <random>

#include "project/stores/SystemDisk.hpp"

namespace project::test {

namespace {

constexpr std::size_t batchesThatStay = 5;

std::u16string toText(std::size_t number) {
    auto const digits = std::to_string(number);
    return {digits.begin(), digits.end()};
}

Address fileOf(std::size_t writer, std::u16string const& name) {
    return fileAddress(u"writer" + toText(writer) + u"/" + name);
}

Address noteOf(std::size_t writer) {
    return fileOf(writer, u"note");
}

Batch batchOf(std::size_t writer, std::size_t number) {
    Batch batch{set(fileOf(writer, toText(number) + u"a")), set(fileOf(writer, toText(number) + u"b")),
                set(noteOf(writer), makeNode(u"Info", {{u"Number", toText(number)}}))};
    if (number > batchesThatStay) {
        auto const old = toText(number - batchesThatStay);
        batch.push_back(remove(fileOf(writer, old + u"a")));
        batch.push_back(remove(fileOf(writer, old + u"b")));
    }
    return batch;
}

/// The work of the process.
class Writing {
public:
    Writing(ChildProcess::Parent const& parent, Path root, std::size_t writer, std::uint64_t seed)
        : parent_(parent), root_(std::move(root)), writer_(writer), random_(seed) {}

    [[noreturn]] void goOnForGood() {
        for (;;) {
            TextBackend backend(stores::makeSystemDisk(root_, stores::TextBackend::folderName),
                                upTo(1) == 0 ? appending() : rewriting());
            for (auto count = upTo(12); count > 0; --count) {
                if (auto const choice = upTo(20); choice == 0) {
                    backend.tidy();
                } else if (choice == 1) {
                    contentOf(backend);
                } else {
                    writeNext(backend);
                }
            }
        }
    }

private:
    static TextBackend::Options appending() {
        return {.patience = std::chrono::seconds(60), .alwaysRewritten = 200, .bodyToTail = 1};
    }

    static TextBackend::Options rewriting() {
        return {.patience = std::chrono::seconds(60), .alwaysRewritten = 1'000'000, .bodyToTail = 16};
    }

    std::size_t upTo(std::size_t bound) {
        return std::uniform_int_distribution<std::size_t>(0, bound)(random_);
    }

    void writeNext(TextBackend& backend) {
        auto const number = std::to_string(last_ + 1);
        parent_.say("begins " + number);
        try {
            commit(backend, batchOf(writer_, last_ + 1));
        } catch (StoreError const& error) {
            // Two writers may create the store at the same time, and one of them is asked to try again.
            if (error.kind() != StoreError::Kind::Busy) {
                throw;
            }
            parent_.say("refused " + number);
            return;
        }
        ++last_;
        parent_.say("kept " + number);
    }

    ChildProcess::Parent const& parent_;
    Path root_;
    std::size_t writer_;
    std::mt19937_64 random_;
    std::size_t last_ = 0;
};

} // namespace

KilledWriter::KilledWriter(Path const& root, std::size_t number, std::uint64_t seed)
    : number_(number), process_(std::make_unique<ChildProcess>([=](ChildProcess::Parent const& parent) {
          try {
              Writing(parent, root, number, seed).goOnForGood();
          } catch (std::exception const& error) {
              parent.say(std::string("complains ") + error.what());
          }
      })) {
}

void KilledWriter::listen() {
    while (process_->hasSaid()) {
        auto const line = process_->hear();
        auto const space = line.find(' ');
        auto const word = line.substr(0, space);
        if (line.empty()) {
            return;
        }
        std::size_t number = 0;
        std::from_chars(line.data() + space + 1, line.data() + line.size(), number);
        if (word == "complains") {
            complaint_ = line;
        } else if (word == "begins") {
            begun_ = number;
        } else if (word == "kept") {
            kept_ = number;
        } else {
            begun_ = kept_;
        }
    }
}

void KilledWriter::kill() {
    process_->kill();
    listen();
}

std::size_t KilledWriter::notedIn(Content const& content) const {
    auto const note = content.find(noteOf(number_));
    if (note == content.end()) {
        return 0;
    }
    std::size_t number = 0;
    auto const& value = note->second;
    std::from_chars(value.data() + value.find('=') + 1, value.data() + value.size(), number);
    return number;
}

Content KilledWriter::contentWith(std::size_t batch) const {
    std::vector<Batch> batches;
    for (std::size_t number = 1; number <= batch; ++number) {
        if (number + batchesThatStay > batch) {
            auto next = batchOf(number_, number);
            std::erase_if(next,
                          [](auto const& change) { return change.kind == stores::Change::Kind::Remove; });
            batches.push_back(std::move(next));
        }
    }
    return contentAfter(batches);
}

} // namespace project::test

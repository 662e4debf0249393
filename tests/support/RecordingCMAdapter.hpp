#pragma once

#include <functional>
#include <map>
#include <optional>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "cmlink/CMAdapter.hpp"
#include "support/PathLines.hpp"

namespace project::test {

/// The exception of failOnce.
class AdapterFailure : public std::runtime_error {
public:
    AdapterFailure() : std::runtime_error("source control is out of reach") {}
};

/// A source-control system that does nothing, writes down every call as one line (see PathLines.hpp), and
/// returns the states that were set.
class RecordingCMAdapter : public cmlink::CMAdapter {
public:
    using Path = cmlink::Path;

    void addToSourceControl(std::vector<Path> const& files) override { record(u"addToSourceControl", files); }

    void removeFromSourceControl(std::vector<Path> const& files) override {
        record(u"removeFromSourceControl", files);
    }

    std::map<Path, cmlink::FileState> getFileStates(std::vector<Path> const& files) override {
        record(u"getFileStates", files);
        std::map<Path, cmlink::FileState> result;
        for (auto const& file : files) {
            auto const own = states_.find(file);
            auto const state = own != states_.end() ? own->second : stateOfOthers_;
            if (state) {
                result.emplace(file, cmlink::FileState(static_cast<cmlink::LocalStatus>(*state)));
            }
        }
        return result;
    }

    /// From now on this file has this state; none if it is empty.
    void setState(Path const& file, std::optional<int> state) { states_[file] = state; }

    /// From now on, all files without a state of their own have this one; none if it is empty, as initially.
    void setStateOfOthers(std::optional<int> state) { stateOfOthers_ = state; }

    /// The next call of the named operation throws an AdapterFailure; it is written down.
    void failOnce(std::u16string operation) { failing_ = std::move(operation); }

    /// Called at the beginning of each call, with the name of the operation.
    std::function<void(std::u16string const&)> onCall;

    /// All calls since the last time.
    std::vector<std::u16string> take() { return std::exchange(calls_, {}); }

private:
    void record(std::u16string const& operation, std::vector<Path> const& files) {
        calls_.push_back(line(operation, files));
        if (onCall) {
            onCall(operation);
        }
        if (failing_ == operation) {
            failing_.clear();
            throw AdapterFailure();
        }
    }

    std::map<Path, std::optional<int>> states_;
    std::optional<int> stateOfOthers_;
    std::u16string failing_;
    std::vector<std::u16string> calls_;
};

} // namespace project::test

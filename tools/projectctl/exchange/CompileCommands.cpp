#include "exchange/CompileCommands.hpp"

#include <algorithm>
#include <iterator>
#include <utility>

#include <nlohmann/json.hpp>

#include "cli/CommandText.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

/// Passes bytes to the parser, and counts the lines that it has read.
class CountingIterator {
public:
    using iterator_category = std::input_iterator_tag;
    using value_type = char;
    using difference_type = std::ptrdiff_t;
    using pointer = char const*;
    using reference = char const&;

    CountingIterator(char const* at, std::size_t& line) : at_(at), line_(&line) {}

    reference operator*() const { return *at_; }

    CountingIterator& operator++() {
        *line_ += *at_ == '\n' ? 1 : 0;
        ++at_;
        return *this;
    }

    bool operator==(CountingIterator const& other) const { return at_ == other.at_; }

private:
    char const* at_;
    std::size_t* line_;
};

/// Collects the entries: texts at the second level, and the texts of "arguments" at the third.
class EntryReader : public nlohmann::json_sax<nlohmann::json> {
public:
    explicit EntryReader(std::size_t const& line) : line_(line) {}

    bool null() override { return true; }

    bool boolean(bool /*value*/) override { return true; }

    bool number_integer(number_integer_t /*value*/) override { return true; }

    bool number_unsigned(number_unsigned_t /*value*/) override { return true; }

    bool number_float(number_float_t /*value*/, string_t const& /*text*/) override { return true; }

    bool binary(binary_t& /*value*/) override { return true; }

    bool string(string_t& value) override {
        if (depth_ == 2) {
            takeText(value);
        } else if (depth_ == 3 && key_ == "arguments") {
            arguments_.push_back(value);
        }
        return true;
    }

    bool key(string_t& name) override {
        if (depth_ == 2) {
            key_ = name;
        }
        return true;
    }

    bool start_object(std::size_t /*count*/) override {
        if (++depth_ == 2) {
            entries_.emplace_back().line = line_;
            arguments_.clear();
        }
        return depth_ > 1; // the top level is an array
    }

    bool end_object() override {
        if (depth_-- == 2 && entries_.back().output.empty()) {
            entries_.back().output = outputOf(arguments_);
        }
        return true;
    }

    bool start_array(std::size_t /*count*/) override {
        isArray_ = isArray_ || depth_ == 0;
        return ++depth_ != 2; // the elements are objects
    }

    bool end_array() override {
        --depth_;
        return true;
    }

    bool parse_error(std::size_t /*position*/, std::string const& /*token*/,
                     nlohmann::detail::exception const& error) override {
        problem_ = error.what();
        return false;
    }

    std::vector<CompiledFile> take() { return std::move(entries_); }

    bool isArray() const { return isArray_; }

    std::string const& problem() const { return problem_; }

private:
    void takeText(std::string const& value) {
        auto& entry = entries_.back();
        if (key_ == "directory") {
            entry.directory = value;
        } else if (key_ == "file") {
            entry.file = value;
        } else if (key_ == "output") {
            entry.output = value;
        } else if (key_ == "command") {
            arguments_ = wordsOf(value);
        }
    }

    static std::vector<std::string> wordsOf(std::string const& command) {
        try {
            auto line = CommandText(command).next();
            return line ? std::move(line->words) : std::vector<std::string>();
        } catch (Failure const&) {
            return {}; // the output is not known
        }
    }

    static std::string outputOf(std::vector<std::string> const& arguments) {
        auto const option = std::ranges::find(arguments, "-o");
        return option != arguments.end() && std::next(option) != arguments.end() ? *std::next(option) : "";
    }

    std::size_t const& line_;
    int depth_ = 0;
    bool isArray_ = false;
    std::string key_;
    std::vector<std::string> arguments_;
    std::vector<CompiledFile> entries_;
    std::string problem_ = Message("NotAnArray").text();
};

} // namespace

std::vector<CompiledFile> readCompileCommands(std::string_view text) {
    std::size_t line = 1;
    EntryReader reader(line);
    CountingIterator const begin(text.data(), line);
    CountingIterator const end(text.data() + text.size(), line);
    if (!nlohmann::json::sax_parse(begin, end, &reader) || !reader.isArray()) {
        throw Failure(Message("NotCompilationDatabase", reader.problem()));
    }
    return reader.take();
}

std::string targetFolderOf(std::string_view output) {
    constexpr std::string_view cmakeFolder = "CMakeFiles/";
    constexpr std::string_view targetEnd = ".dir/";
    std::size_t const cmake = output.find(cmakeFolder);
    bool const isElement = cmake == 0 || (cmake != std::string_view::npos && output[cmake - 1] == '/');
    std::size_t const end = isElement ? output.find(targetEnd, cmake) : std::string_view::npos;
    if (end != std::string_view::npos) {
        std::size_t const name = cmake + cmakeFolder.size();
        return std::string(output.substr(0, cmake)) + std::string(output.substr(name, end - name));
    }
    std::size_t const slash = output.rfind('/');
    return slash == std::string_view::npos ? "" : std::string(output.substr(0, slash));
}

} // namespace projectctl

#pragma once

#include <algorithm>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace project::test {

/// The expected state of a project in plain containers. Every command of the tool that changes the project
/// has a counterpart here, and every command that shows something has its expected output. Paths are relative
/// to the root.
class ProjectModel {
public:
    struct Entry {
        std::string type = "Basic";
        std::string name;
        std::string group = "Default"; ///< empty when its group was deleted
        bool visible = true;
    };

    using Lines = std::multiset<std::string>;

    void createOnDisk(std::string const& file) {
        for (auto path = file; !path.empty(); path = parentOf(path)) {
            disk_[path] = disk_.contains(path) ? disk_[path] : path != file;
        }
    }

    void removeFromDisk(std::string const& file) { disk_.erase(file); }

    /// Adds files that are not in the project. The folders above them keep their labels.
    void add(std::vector<std::string> const& files) {
        for (auto const& file : files) {
            for (auto path = file; !path.empty(); path = parentOf(path)) {
                files_.try_emplace(path);
            }
        }
    }

    /// As `add --recursive`.
    void addContents(std::string const& folder) {
        std::vector<std::string> added;
        for (auto const& [path, isFolder] : disk_) {
            if (isWithin(path, folder) && !files_.contains(path)) {
                added.push_back(path);
            }
        }
        add(added);
    }

    /// As `add --anew` of one path.
    void addAnew(std::string const& file) { files_[file] = {}; }

    void remove(std::string const& file) {
        std::erase_if(files_, [&](auto const& item) { return isWithin(item.first, file); });
        std::erase_if(entries_, [&](auto const& item) { return isWithin(item.first, file); });
    }

    void createCategory(std::string const& name, bool isSingleValued) {
        categories_[name].first = isSingleValued;
    }

    void createLabel(std::string const& category, std::string const& label) {
        categories_[category].second.insert(label);
    }

    void renameCategory(std::string const& name, std::string const& newName) {
        auto moved = categories_.extract(name);
        moved.key() = newName;
        categories_.insert(std::move(moved));
        for (auto& [file, labels] : files_) {
            std::set<Label> renamed;
            for (auto const& [category, label] : labels) {
                renamed.emplace(category == name ? newName : category, label);
            }
            labels = renamed;
        }
    }

    void deleteCategory(std::string const& name) {
        categories_.erase(name);
        for (auto& [file, labels] : files_) {
            std::erase_if(labels, [&](Label const& label) { return label.first == name; });
        }
    }

    void deleteLabel(std::string const& category, std::string const& name) {
        categories_[category].second.erase(name);
        for (auto& [file, labels] : files_) {
            labels.erase({category, name});
        }
    }

    void put(std::string const& category, std::string const& name, std::string const& file) {
        auto& labels = files_.at(file);
        if (categories_[category].first) {
            std::erase_if(labels, [&](Label const& label) { return label.first == category; });
        }
        labels.emplace(category, name);
    }

    void take(std::string const& category, std::string const& name, std::string const& file) {
        files_.at(file).erase({category, name});
    }

    Entry& entry(std::string const& file) {
        auto const [found, isNew] = entries_.try_emplace(file);
        if (isNew) {
            auto const name = file.substr(file.rfind('/') + 1);
            found->second.name = name.substr(0, name.rfind('.'));
        }
        return found->second;
    }

    void removeEntry(std::string const& file) { entries_.erase(file); }

    void createGroup(std::string const& name) { groups_.insert(name); }

    void renameGroup(std::string const& name, std::string const& newName) {
        groups_.erase(name);
        groups_.insert(newName);
        for (auto& [file, entry] : entries_) {
            entry.group = entry.group == name ? newName : entry.group;
        }
    }

    void deleteGroup(std::string const& name) {
        groups_.erase(name);
        for (auto& [file, entry] : entries_) {
            entry.group = entry.group == name ? "" : entry.group;
        }
    }

    Lines list() const {
        Lines result;
        for (auto const& [path, labels] : files_) {
            result.insert(path);
        }
        return result;
    }

    Lines find(std::string const& category, std::string const& name) const {
        Lines result;
        for (auto const& [path, labels] : files_) {
            if (labels.contains({category, name})) {
                result.insert(path);
            }
        }
        return result;
    }

    Lines labelsOn(std::string const& file) const {
        Lines result;
        for (auto const& [category, name] : files_.at(file)) {
            result.insert(category + ": " + name);
        }
        return result;
    }

    Lines categories() const {
        Lines result;
        for (auto const& [name, category] : categories_) {
            result.insert(name + (category.first ? " (single-valued)" : ""));
        }
        return result;
    }

    Lines labels() const {
        Lines result;
        for (auto const& [category, content] : categories_) {
            for (auto const& name : content.second) {
                result.insert(category + ": " + name);
            }
        }
        return result;
    }

    Lines entries() const {
        Lines result;
        for (auto const& [file, entry] : entries_) {
            result.insert(file + ": " + entry.type + ", " + entry.name + (entry.visible ? "" : " (hidden)"));
        }
        return result;
    }

    Lines groups() const {
        Lines result(groups_.begin(), groups_.end());
        result.insert("Default");
        return result;
    }

    /// The lines of status about files.
    Lines differences() const {
        Lines result;
        for (auto const& [path, isFolder] : disk_) {
            bool const isShown = parentOf(path).empty() || hasAnyBelow(parentOf(path));
            if (!files_.contains(path) && isShown) {
                result.insert("new  " + path + (isFolder ? "/" : ""));
            }
        }
        for (auto const& [path, labels] : files_) {
            if (!disk_.contains(path)) {
                result.insert("gone " + path);
            }
        }
        return result;
    }

    /// The number of problems that status reports for entry points: missing files and missing groups.
    std::size_t entryProblems() const {
        std::size_t result = 0;
        for (auto const& [file, entry] : entries_) {
            result += (disk_.contains(file) ? 0 : 1) + (entry.group.empty() ? 1 : 0);
        }
        return result;
    }

    /// Whether an entry point is in a deleted group. A missing file is not a fault of the definition.
    bool hasFaults() const {
        return std::any_of(entries_.begin(), entries_.end(),
                           [](auto const& item) { return item.second.group.empty(); });
    }

    std::vector<std::string> files() const { return keysOf(files_); }

    std::vector<std::string> entryFiles() const { return keysOf(entries_); }

    /// Whether a path of the project is not a folder on disk.
    bool isFile(std::string const& path) const {
        auto const found = disk_.find(path);
        return found == disk_.end() || !found->second;
    }

private:
    using Label = std::pair<std::string, std::string>; ///< category and name

    static std::string parentOf(std::string const& path) {
        auto const separator = path.rfind('/');
        return separator == std::string::npos ? std::string() : path.substr(0, separator);
    }

    static bool isWithin(std::string const& path, std::string const& folder) {
        return folder.empty() || path == folder || path.starts_with(folder + '/');
    }

    template <typename Map>
    static std::vector<std::string> keysOf(Map const& map) {
        std::vector<std::string> result;
        for (auto const& item : map) {
            result.push_back(item.first);
        }
        return result;
    }

    /// Whether a folder or something below it is in the project.
    bool hasAnyBelow(std::string const& folder) const {
        auto const below = files_.lower_bound(folder + '/');
        return files_.contains(folder) || (below != files_.end() && isWithin(below->first, folder));
    }

    std::map<std::string, bool> disk_; ///< true for a folder
    std::map<std::string, std::set<Label>> files_;
    std::map<std::string, std::pair<bool, std::set<std::string>>> categories_; ///< single-valued, labels
    std::map<std::string, Entry> entries_;
    std::set<std::string> groups_;
};

} // namespace project::test

#include <algorithm>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include <pybind11/stl.h>

#include "Bindings.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/labels/CategoryIdentifier.hpp"
#include "project/labels/Label.hpp"
#include "project/labels/LabelDataValidators.hpp"
#include "project/labels/LabelIdentifier.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/session/ToolAccess.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::python {

namespace py = pybind11;

namespace {

using management::CategoryDefinition;
using management::CategoryIdentifier;
using management::Label;
using management::LabelDefinition;
using management::LabelIdentifier;
using management::LabelReadOnlyState;
using metadata::MetadataNode;

namespace schema = metadata::schema;

/// UUID, name, whether it is read-only, whether it is single-valued, and the data type.
using CategoryValues = std::tuple<std::u16string, std::u16string, bool, bool, std::u16string>;

/// UUID, name, and a LabelReadOnlyState.
using LabelValues = std::tuple<std::u16string, std::u16string, int>;

CategoryValues valuesOf(CategoryIdentifier const& category) {
    return {category.getUUID(), category.getName(), category.isReadOnly(), category.isSingleValued(),
            category.getDataType()};
}

LabelValues valuesOf(LabelIdentifier const& label) {
    return {label.getUUID(), label.getName(), static_cast<int>(label.isReadOnly())};
}

CategoryIdentifier categoryOf(CategoryValues const& values) {
    auto const& [uuid, name, isReadOnly, isSingleValued, dataType] = values;
    return {uuid, name, isReadOnly, isSingleValued, dataType};
}

LabelIdentifier labelOf(LabelValues const& values) {
    auto const& [uuid, name, state] = values;
    return {uuid, name, static_cast<LabelReadOnlyState>(state)};
}

/// The layer of labels that an operation concerns.
class Layer {
public:
    Layer(Session& session, bool isPersonal) : session_(session), isPersonal_(isPersonal) {}

    management::LabelManager& labels() const {
        return isPersonal_ ? session_.personal().getLabelManager() : session_.project().getLabelManager();
    }

    management::FileManager& files() const {
        return isPersonal_ ? session_.personal().getFileManager() : session_.project().getFileManager();
    }

    stores::TreeMetadataManager& store() const {
        session::ToolAccess access(session_);
        return isPersonal_ ? access.personalStore() : access.store();
    }

private:
    Session& session_;
    bool isPersonal_;
};

std::vector<CategoryValues> categories(OpenProject const& project, bool isPersonal) {
    return project.run([&](Session& session) {
        std::vector<CategoryValues> result;
        for (auto const& category : Layer(session, isPersonal).labels().getAllCategories()) {
            result.push_back(valuesOf(category));
        }
        return result;
    });
}

CategoryValues createCategory(OpenProject const& project, bool isPersonal, std::u16string const& name,
                              std::u16string const& uuid, bool isReadOnly, bool isSingleValued,
                              std::u16string const& dataType) {
    auto category = uuid.empty() ? CategoryDefinition(name) : CategoryDefinition(name, uuid);
    category.setIsReadOnly(isReadOnly).setIsSingleValued(isSingleValued).setDataType(dataType);
    project.run([&](Session& session) { Layer(session, isPersonal).labels().createCategory(category); });
    return valuesOf(category);
}

std::vector<LabelValues> labels(OpenProject const& project, bool isPersonal, CategoryValues const& category) {
    return project.run([&](Session& session) {
        std::vector<LabelValues> result;
        for (auto const& label : Layer(session, isPersonal).labels().getLabels(categoryOf(category))) {
            result.push_back(valuesOf(label));
        }
        return result;
    });
}

LabelValues createLabel(OpenProject const& project, bool isPersonal, CategoryValues const& category,
                        std::u16string const& name, std::u16string const& uuid, int state) {
    auto label = uuid.empty() ? LabelDefinition(name) : LabelDefinition(name, uuid);
    label.setIsReadOnly(static_cast<LabelReadOnlyState>(state));
    project.run([&](Session& session) {
        Layer(session, isPersonal).labels().createLabel(categoryOf(category), label);
    });
    return valuesOf(label);
}

MetadataNode* recordOf(MetadataNode const& node, std::u16string const& labelUUID) {
    for (auto const& record : node.getChildren()) {
        if (record->get(schema::files::recordUUIDKey) == labelUUID) {
            return record.get();
        }
    }
    return nullptr;
}

/// Stores the data of a label on files. The managers read these records and have no operation that writes
/// them. Call it in a transaction.
void setData(Session& session, Layer const& layer, std::vector<Path> const& files,
             std::u16string const& labelUUID, std::u16string const& data) {
    std::map<metadata::MetadataPath, std::shared_ptr<MetadataNode>> changed;
    for (auto const& file : files) {
        auto const address = session::ToolAccess(session).addressOf(file).child(
            metadata::PathElement(schema::files::labelDataType, schema::files::labelDataLocation));
        std::shared_ptr<MetadataNode> node = layer.store().getNode(address);
        if (!node) {
            node = std::make_shared<metadata::MetadataNodeSpecification>(schema::nodeType);
        }
        auto* record = recordOf(*node, labelUUID);
        if (record == nullptr) {
            record = node->addChild(schema::files::labelType);
            record->put(schema::files::recordUUIDKey, labelUUID);
        }
        record->put(schema::files::recordValueKey, data);
        changed.emplace(address, std::move(node));
    }
    layer.store().setNodes(changed);
}

bool hasLabel(management::FileManager& files, Path const& file, management::LabelIDSet const& label) {
    auto const labels = files.getLabelIDSets(file);
    return std::find(labels.begin(), labels.end(), label) != labels.end();
}

/// Puts a label on those files that do not have it. @param data nothing keeps the data that it has.
void addLabel(OpenProject const& project, bool isPersonal, py::iterable const& paths,
              CategoryValues const& categoryValues, LabelValues const& labelValues,
              std::optional<std::u16string> const& data) {
    if (isPersonal && data && !data->empty()) {
        throw py::value_error("a personal label has no data");
    }
    auto const files = project.absolutes(paths);
    project.run([&](Session& session) {
        Layer const layer(session, isPersonal);
        auto const category = categoryOf(categoryValues);
        auto const label = labelOf(labelValues);
        auto transaction = session.transaction();
        std::vector<Path> lacking;
        for (auto const& file : files) {
            if (!hasLabel(layer.files(), file, {category, label})) {
                lacking.push_back(file);
            }
        }
        if (!lacking.empty()) {
            layer.files().addLabels(lacking, {Label(category, label)});
        }
        if (data && !isPersonal) {
            setData(session, layer, files, label.getUUID(), *data);
        }
        transaction.commit();
    });
}

void removeLabel(OpenProject const& project, bool isPersonal, py::iterable const& paths,
                 CategoryValues const& category, LabelValues const& label) {
    auto const files = project.absolutes(paths);
    project.run([&](Session& session) {
        Layer(session, isPersonal).files().removeLabels(files, {Label(categoryOf(category), labelOf(label))});
    });
}

/// The labels of a file with their data. A label with data is listed twice by the manager, with its data
/// first.
std::vector<std::tuple<CategoryValues, LabelValues, std::u16string>>
labelsOfFile(OpenProject const& project, bool isPersonal, py::handle path) {
    auto const file = project.absolute(path);
    return project.run([&](Session& session) {
        std::vector<std::tuple<CategoryValues, LabelValues, std::u16string>> result;
        std::set<std::pair<std::u16string, std::u16string>> listed;
        for (auto const& label : Layer(session, isPersonal).files().getLabels(file)) {
            if (listed.emplace(label.getCategory().getUUID(), label.getUUID()).second) {
                result.emplace_back(valuesOf(label.getCategory()), valuesOf(label.getLabelIdentifier()),
                                    label.getData());
            }
        }
        return result;
    });
}

bool isValidData(std::u16string const& dataType, std::u16string const& text) {
    auto const validator = management::LabelDataValidators().getValidator(
        [&dataType](auto const& each) { return each.getDataType() == dataType; });
    return validator == nullptr || validator->isValid(text);
}

} // namespace

void bindLabels(py::module_& module, ProjectClass& project) {
    module.def("is_valid_data", &isValidData, py::arg("data_type"), py::arg("text"),
               "Whether a text is valid data for labels of a category with this data type.");
    project.def("categories", &categories, py::arg("personal"));
    project.def("create_category", &createCategory, py::arg("personal"), py::arg("name"), py::arg("uuid"),
                py::arg("read_only"), py::arg("single_valued"), py::arg("data_type"));
    project.def(
        "delete_category",
        [](OpenProject const& open, bool isPersonal, CategoryValues const& values) {
            open.run([&](Session& session) {
                Layer(session, isPersonal).labels().deleteCategory(categoryOf(values));
            });
        },
        py::arg("personal"), py::arg("category"));
    project.def(
        "rename_category",
        [](OpenProject const& open, bool isPersonal, CategoryValues const& values,
           std::u16string const& name) {
            open.run([&](Session& session) {
                Layer(session, isPersonal).labels().renameCategory(categoryOf(values), name);
            });
        },
        py::arg("personal"), py::arg("category"), py::arg("name"));
    project.def("labels", &labels, py::arg("personal"), py::arg("category"));
    project.def("create_label", &createLabel, py::arg("personal"), py::arg("category"), py::arg("name"),
                py::arg("uuid"), py::arg("state"));
    project.def(
        "delete_label",
        [](OpenProject const& open, bool isPersonal, CategoryValues const& category,
           LabelValues const& label) {
            open.run([&](Session& session) {
                Layer(session, isPersonal).labels().deleteLabel(categoryOf(category), labelOf(label));
            });
        },
        py::arg("personal"), py::arg("category"), py::arg("label"));
    project.def("add_label", &addLabel, py::arg("personal"), py::arg("paths"), py::arg("category"),
                py::arg("label"), py::arg("data"));
    project.def("remove_label", &removeLabel, py::arg("personal"), py::arg("paths"), py::arg("category"),
                py::arg("label"));
    project.def(
        "remove_category",
        [](OpenProject const& open, bool isPersonal, py::iterable const& paths,
           CategoryValues const& category) {
            auto const files = open.absolutes(paths);
            open.run([&](Session& session) {
                Layer(session, isPersonal).files().removeCategory(files, categoryOf(category));
            });
        },
        py::arg("personal"), py::arg("paths"), py::arg("category"));
    project.def("labels_of_file", &labelsOfFile, py::arg("personal"), py::arg("path"));
    project.def("hidden_files", [](OpenProject const& open) {
        return open.relatives(open.run([](Session& session) { return session.personal().hiddenFiles(); }));
    });
    project.def("remove_hidden", [](OpenProject const& open) {
        return open.relatives(open.run([](Session& session) { return session.personal().removeHidden(); }));
    });
}

} // namespace project::python

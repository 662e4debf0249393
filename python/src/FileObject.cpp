#include "FileObject.hpp"

#include <cstddef>

#include <structmember.h>

namespace project::python {

namespace py = pybind11;

namespace {

constexpr char unknownKind = -1;

struct FileFields {
    PyObject_HEAD PyObject* project;
    PyObject* path; ///< relative to the root
    char kind;      ///< a session::FileKind, or unknownKind
};

FileFields* fieldsOf(PyObject* object) {
    return reinterpret_cast<FileFields*>(object);
}

PyObject* createFile(PyTypeObject* type, PyObject* arguments, PyObject* /*keywords*/) {
    PyObject* project = nullptr;
    PyObject* path = nullptr;
    char kind = unknownKind;
    if (PyArg_ParseTuple(arguments, "OU|b", &project, &path, &kind) == 0) {
        return nullptr;
    }
    auto* const object = type->tp_alloc(type, 0);
    if (object != nullptr) {
        fieldsOf(object)->project = Py_NewRef(project);
        fieldsOf(object)->path = Py_NewRef(path);
        fieldsOf(object)->kind = kind;
    }
    return object;
}

int visitFile(PyObject* object, visitproc visit, void* arg) {
    Py_VISIT(Py_TYPE(object));
    Py_VISIT(fieldsOf(object)->project);
    return 0;
}

int clearFile(PyObject* object) {
    Py_CLEAR(fieldsOf(object)->project);
    return 0;
}

void destroyFile(PyObject* object) {
    PyObject_GC_UnTrack(object);
    auto* const type = Py_TYPE(object);
    clearFile(object);
    Py_CLEAR(fieldsOf(object)->path);
    type->tp_free(object);
    Py_DECREF(type);
}

PyMemberDef fileMembers[] = {
    {"_project", T_OBJECT_EX, offsetof(FileFields, project), READONLY, nullptr},
    {"_path", T_OBJECT_EX, offsetof(FileFields, path), READONLY, nullptr},
    {"_kind", T_BYTE, offsetof(FileFields, kind), READONLY, nullptr},
    {nullptr, 0, 0, 0, nullptr},
};

/// Keeps the collector of garbage from running as long as it exists. Each of its runs would visit the objects
/// of a list that grows, none of which is garbage.
class WithoutCollector {
public:
    WithoutCollector() : wasEnabled_(PyGC_Disable() != 0) {}

    WithoutCollector(WithoutCollector const&) = delete;
    WithoutCollector& operator=(WithoutCollector const&) = delete;

    ~WithoutCollector() {
        if (wasEnabled_) {
            PyGC_Enable();
        }
    }

private:
    bool wasEnabled_;
};

template <typename Function>
void* slot(Function* function) {
    return reinterpret_cast<void*>(function);
}

PyType_Slot fileSlots[] = {
    {Py_tp_doc,
     const_cast<char*>("A file of a project: its project, its path relative to the root, its kind.")},
    {Py_tp_new, slot(createFile)},
    {Py_tp_dealloc, slot(destroyFile)},
    {Py_tp_traverse, slot(visitFile)},
    {Py_tp_clear, slot(clearFile)},
    {Py_tp_members, fileMembers},
    {0, nullptr},
};

PyType_Spec fileSpec = {"project_management._core.FileBase", sizeof(FileFields), 0,
                        Py_TPFLAGS_DEFAULT | Py_TPFLAGS_BASETYPE | Py_TPFLAGS_HAVE_GC, fileSlots};

} // namespace

void bindFileObject(py::module_& module) {
    auto* const type = PyType_FromSpec(&fileSpec);
    if (type == nullptr) {
        throw py::error_already_set();
    }
    module.add_object("FileBase", py::reinterpret_steal<py::object>(type));
}

FileObjects::FileObjects(OpenProject const& open, py::handle type, py::handle project)
    : open_(open), type_(reinterpret_cast<PyTypeObject*>(type.ptr())), project_(project) {
}

py::list FileObjects::of(std::vector<session::FoundFile> const& files) const {
    WithoutCollector const withoutCollector;
    py::list result(files.size());
    for (std::size_t i = 0; i < files.size(); ++i) {
        result[i] = create(open_.relative(files[i].path), files[i].kind);
    }
    return result;
}

py::list FileObjects::of(FileList const& files) const {
    WithoutCollector const withoutCollector;
    py::list result(files.size());
    py::ssize_t next = 0;
    files.visit([&](std::u16string_view path, session::FileKind kind) {
        PyList_SET_ITEM(result.ptr(), next++, create(fromPath(path), kind).release().ptr());
    });
    return result;
}

py::object FileObjects::create(py::str path, session::FileKind kind) const {
    auto object = py::reinterpret_steal<py::object>(type_->tp_alloc(type_, 0));
    if (!object) {
        throw py::error_already_set();
    }
    auto* const fields = fieldsOf(object.ptr());
    fields->project = Py_NewRef(project_.ptr());
    fields->path = path.release().ptr();
    fields->kind = static_cast<char>(kind);
    return object;
}

} // namespace project::python

#pragma once

#include <git2.h>
#include <git2/sys/repository.h>

namespace project::git {

/// The functions of libgit2 that this layer calls. The first call loads libgit2, not the start of the
/// program: libgit2 depends on some twenty libraries, and loading them takes longer than most commands of a
/// tool.
class LibGitFunctions {
public:
    /// @throws GitError if libgit2 cannot be loaded, or is not the version that this layer was built for.
    LibGitFunctions();

private:
    /// An address that becomes the function that it initialises.
    class Symbol {
    public:
        explicit Symbol(void* address) : address_(address) {}

        template <typename Function>
        operator Function*() const { // NOLINT(google-explicit-constructor): the type is that of the member
            return reinterpret_cast<Function*>(address_);
        }

    private:
        void* address_;
    };

    Symbol symbol(char const* name) const;

    void* const library_; ///< never closed: libgit2's threads and exit handlers may still use it

public:
    decltype(&::git_attr_get_many) const git_attr_get_many = symbol("git_attr_get_many");
    decltype(&::git_attr_value) const git_attr_value = symbol("git_attr_value");
    decltype(&::git_blob_create_from_workdir) const git_blob_create_from_workdir =
        symbol("git_blob_create_from_workdir");
    decltype(&::git_blob_free) const git_blob_free = symbol("git_blob_free");
    decltype(&::git_blob_lookup) const git_blob_lookup = symbol("git_blob_lookup");
    decltype(&::git_blob_rawcontent) const git_blob_rawcontent = symbol("git_blob_rawcontent");
    decltype(&::git_blob_rawsize) const git_blob_rawsize = symbol("git_blob_rawsize");
    decltype(&::git_buf_dispose) const git_buf_dispose = symbol("git_buf_dispose");
    decltype(&::git_commit_free) const git_commit_free = symbol("git_commit_free");
    decltype(&::git_commit_parent) const git_commit_parent = symbol("git_commit_parent");
    decltype(&::git_commit_parentcount) const git_commit_parentcount = symbol("git_commit_parentcount");
    decltype(&::git_commit_tree) const git_commit_tree = symbol("git_commit_tree");
    decltype(&::git_config_add_file_ondisk) const git_config_add_file_ondisk =
        symbol("git_config_add_file_ondisk");
    decltype(&::git_config_entry_free) const git_config_entry_free = symbol("git_config_entry_free");
    decltype(&::git_config_free) const git_config_free = symbol("git_config_free");
    decltype(&::git_config_get_bool) const git_config_get_bool = symbol("git_config_get_bool");
    decltype(&::git_config_get_entry) const git_config_get_entry = symbol("git_config_get_entry");
    decltype(&::git_config_get_path) const git_config_get_path = symbol("git_config_get_path");
    decltype(&::git_config_get_string_buf) const git_config_get_string_buf =
        symbol("git_config_get_string_buf");
    decltype(&::git_error_last) const git_error_last = symbol("git_error_last");
    decltype(&::git_filter_list_apply_to_buffer) const git_filter_list_apply_to_buffer =
        symbol("git_filter_list_apply_to_buffer");
    decltype(&::git_filter_list_free) const git_filter_list_free = symbol("git_filter_list_free");
    decltype(&::git_filter_list_load) const git_filter_list_load = symbol("git_filter_list_load");
    decltype(&::git_index_add) const git_index_add = symbol("git_index_add");
    decltype(&::git_index_entry_is_conflict) const git_index_entry_is_conflict =
        symbol("git_index_entry_is_conflict");
    decltype(&::git_index_free) const git_index_free = symbol("git_index_free");
    decltype(&::git_index_new) const git_index_new = symbol("git_index_new");
    decltype(&::git_index_open) const git_index_open = symbol("git_index_open");
    decltype(&::git_libgit2_init) const git_libgit2_init = symbol("git_libgit2_init");
    decltype(&::git_libgit2_opts) const git_libgit2_opts = symbol("git_libgit2_opts");
    decltype(&::git_libgit2_shutdown) const git_libgit2_shutdown = symbol("git_libgit2_shutdown");
    decltype(&::git_object_free) const git_object_free = symbol("git_object_free");
    decltype(&::git_odb_add_backend) const git_odb_add_backend = symbol("git_odb_add_backend");
    decltype(&::git_odb_backend_loose) const git_odb_backend_loose = symbol("git_odb_backend_loose");
    decltype(&::git_odb_free) const git_odb_free = symbol("git_odb_free");
    decltype(&::git_odb_hash) const git_odb_hash = symbol("git_odb_hash");
    decltype(&::git_odb_new) const git_odb_new = symbol("git_odb_new");
    decltype(&::git_odb_write) const git_odb_write = symbol("git_odb_write");
    decltype(&::git_oid_equal) const git_oid_equal = symbol("git_oid_equal");
    decltype(&::git_oid_fromraw) const git_oid_fromraw = symbol("git_oid_fromraw");
    decltype(&::git_reference_free) const git_reference_free = symbol("git_reference_free");
    decltype(&::git_reference_name_to_id) const git_reference_name_to_id = symbol("git_reference_name_to_id");
    decltype(&::git_reference_peel) const git_reference_peel = symbol("git_reference_peel");
    decltype(&::git_repository_commondir) const git_repository_commondir = symbol("git_repository_commondir");
    decltype(&::git_repository_config) const git_repository_config = symbol("git_repository_config");
    decltype(&::git_repository_discover) const git_repository_discover = symbol("git_repository_discover");
    decltype(&::git_repository_free) const git_repository_free = symbol("git_repository_free");
    decltype(&::git_repository_hashfile) const git_repository_hashfile = symbol("git_repository_hashfile");
    decltype(&::git_repository_head) const git_repository_head = symbol("git_repository_head");
    decltype(&::git_repository_open_ext) const git_repository_open_ext = symbol("git_repository_open_ext");
    decltype(&::git_repository_path) const git_repository_path = symbol("git_repository_path");
    decltype(&::git_repository_set_index) const git_repository_set_index = symbol("git_repository_set_index");
    decltype(&::git_repository_set_workdir) const git_repository_set_workdir =
        symbol("git_repository_set_workdir");
    decltype(&::git_repository_workdir) const git_repository_workdir = symbol("git_repository_workdir");
    decltype(&::git_tree_entry_byname) const git_tree_entry_byname = symbol("git_tree_entry_byname");
    decltype(&::git_tree_entry_bypath) const git_tree_entry_bypath = symbol("git_tree_entry_bypath");
    decltype(&::git_tree_entry_filemode) const git_tree_entry_filemode = symbol("git_tree_entry_filemode");
    decltype(&::git_tree_entry_free) const git_tree_entry_free = symbol("git_tree_entry_free");
    decltype(&::git_tree_entry_id) const git_tree_entry_id = symbol("git_tree_entry_id");
    decltype(&::git_tree_entry_type) const git_tree_entry_type = symbol("git_tree_entry_type");
    decltype(&::git_tree_free) const git_tree_free = symbol("git_tree_free");
    decltype(&::git_tree_id) const git_tree_id = symbol("git_tree_id");
    decltype(&::git_tree_lookup) const git_tree_lookup = symbol("git_tree_lookup");
};

/// Loaded by the first call; several threads may call it.
LibGitFunctions const& libgit();

} // namespace project::git

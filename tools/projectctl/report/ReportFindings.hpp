#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "output/Progress.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// A finding of `check` or `status`.
struct ReportFinding {
    std::string_view source; ///< the verb that shows it too
    std::string_view code;   ///< of FindingCode.hpp; or "new" or "gone" for a difference to the disk
    bool isFault;
    std::string text;    ///< in UTF-8; empty for a difference to the disk
    std::u16string path; ///< relative to the root; empty if it is not about one file
};

struct ReportFindings {
    std::vector<ReportFinding> findings; ///< faults before notes
    std::size_t omitted = 0;             ///< those of a code that has too many to list
};

/// Collects everything that `check` and `status` show, each once.
/// @param page the file that the report is written to, which is not a difference.
ReportFindings collectFindings(OpenProject& project, Path const& page, Progress& progress);

} // namespace projectctl

#pragma once
// The words of a dry run: what a run would do with a record and why, in one
// line ("download new records after the local copy's last record (Always);
// no upload (Never)"). Pure: the plan is decided beforehand.

#include "app/run/file_processor.h"
#include "app/run/run_settings.h"

#include <QString>

namespace quorvel {

// account: the "Download which dates" choice in force for this record.
QString DescribePlan(const FileRecord& record, const FilePlan& plan,
                     const AccountSettings& account);

} // namespace quorvel

#pragma once
// Which way a record's file travels, and how: the rules of the record fields
// that keep a record's choices consistent, and the one decision a run takes
// for each file. Pure functions, no files and no network.

#include "app/file_record.h"

#include <cstdint>

namespace quorvel {

// The transfer choices of one record, as its fields hold them.
struct TransferRules {
    int download = kDownloadNever;
    int upload = kUploadNever;
    int method = kMethodCompleteFile;
    bool zip = false;

    bool operator==(const TransferRules&) const = default;
};

TransferRules RulesOf(const FileRecord& record);

// The user's choices and what they settle: "Always" in one direction excludes
// "Always" in the other, zipped files travel whole, a dated layout means only
// new data and "[no date]" the complete file.
TransferRules ChooseDownload(TransferRules rules, int download);
TransferRules ChooseUpload(TransferRules rules, int upload);
TransferRules ChooseMethod(TransferRules rules, int method);
TransferRules ChooseZip(TransferRules rules, bool zip);
TransferRules ChooseDataType(TransferRules rules, int dataType);

// The record as the window's fields show it: option values clamped to their
// groups, unknown data types as none, check boxes as 1 or 0. A run takes every
// record in this form, whoever shows the run.
FileRecord AsShownInFields(FileRecord record);

// What the decision looks at besides the rules.
struct TransferFacts {
    bool downloadOnly = false; // support mode
    bool localExists = false;  // the record's data file on this PC
    bool remoteExists = false; // the file at the service; only read for upload "Once"
    std::int32_t listDay = 0;  // the day of the list's date, 0 for none
    std::int32_t localDay = 0; // the day of the local copy's date, 0 for none
};

struct TransferPlan {
    bool download = false;
    int downloadMethod = kMethodCompleteFile;
    bool upload = false;
    int uploadMethod = kMethodCompleteFile;
    // Downloaded by the "Date" rule: the list names a later day than the local copy has.
    bool newerListDate = false;

    bool operator==(const TransferPlan&) const = default;
};

// True when the decision needs to know whether the file is at the service.
bool NeedsRemoteCheck(const TransferRules& rules, bool downloadOnly);

TransferPlan DecideTransfers(const TransferRules& rules, const TransferFacts& facts);

} // namespace quorvel

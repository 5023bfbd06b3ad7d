#include "app/run/transfer_decision.h"

#include <algorithm>

namespace quorvel {

namespace {

constexpr int kLastDataType = 8; // "Teksmart"

std::int16_t Clamp(int value, int highest) {
    return static_cast<std::int16_t>(std::clamp(value, 0, highest));
}

std::int16_t Check(int value) {
    return value != 0 ? 1 : 0;
}

bool WantsDownload(const TransferRules& rules, const TransferFacts& facts) {
    switch (rules.download) {
    case kDownloadAlways:
        return true;
    case kDownloadOnce:
        return !facts.localExists;
    case kDownloadDate:
        return facts.listDay > facts.localDay;
    default:
        return false;
    }
}

bool WantsUpload(const TransferRules& rules, const TransferFacts& facts) {
    switch (rules.upload) {
    case kUploadAlways:
        return true;
    case kUploadOnce:
        return !facts.remoteExists;
    default:
        return false;
    }
}

} // namespace

TransferRules RulesOf(const FileRecord& record) {
    return {record.Download, record.Upload, record.MethodID, record.Zip != 0};
}

TransferRules ChooseDownload(TransferRules rules, int download) {
    rules.download = download;
    if (download == kDownloadAlways) rules.upload = kUploadNever;
    return rules;
}

TransferRules ChooseUpload(TransferRules rules, int upload) {
    rules.upload = upload;
    if (upload == kUploadAlways && rules.download == kDownloadAlways)
        rules.download = kDownloadNever;
    return rules;
}

TransferRules ChooseMethod(TransferRules rules, int method) {
    rules.method = method;
    if (method == kMethodOnlyNewData) rules.zip = false;
    return rules;
}

TransferRules ChooseZip(TransferRules rules, bool zip) {
    rules.zip = zip;
    if (zip && rules.method == kMethodOnlyNewData) rules.method = kMethodCompleteFile;
    return rules;
}

TransferRules ChooseDataType(TransferRules rules, int dataType) {
    return ChooseMethod(rules, dataType == 0 ? kMethodCompleteFile : kMethodOnlyNewData);
}

FileRecord AsShownInFields(FileRecord record) {
    record.Active = Check(record.Active);
    record.Zip = Check(record.Zip);
    record.TypeID = record.TypeID >= 0 && record.TypeID <= kLastDataType ? record.TypeID : 0;
    record.AdminLocationID = Clamp(record.AdminLocationID, kLocationOther);
    record.UserLocationID = Clamp(record.UserLocationID, kLocationOther);
    record.MethodID = Clamp(record.MethodID, kMethodOnlyNewData);
    record.Download = Clamp(record.Download, kDownloadDate);
    record.Upload = Clamp(record.Upload, kUploadOnce);
    return record;
}

bool NeedsRemoteCheck(const TransferRules& rules, bool downloadOnly) {
    return !downloadOnly && rules.upload == kUploadOnce;
}

TransferPlan DecideTransfers(const TransferRules& rules, const TransferFacts& facts) {
    TransferPlan plan;
    // A zipped file is never appended to record by record: it travels whole,
    // also when a list from the service asks for both.
    const int method = rules.zip ? kMethodCompleteFile : rules.method;
    if (facts.downloadOnly) {
        plan.download = rules.download != kDownloadNever || rules.upload != kUploadNever;
    } else {
        plan.download = WantsDownload(rules, facts);
        plan.upload = WantsUpload(rules, facts);
        plan.newerListDate = rules.download == kDownloadDate && plan.download;
    }
    plan.downloadMethod = method;
    plan.uploadMethod = method;
    if (plan.download && !facts.localExists && method == kMethodOnlyNewData) {
        // Nothing local to append to, and nothing local to send.
        plan.downloadMethod = kMethodCompleteFile;
        plan.upload = false;
    }
    if (!plan.download) plan.downloadMethod = kMethodCompleteFile;
    if (!plan.upload) plan.uploadMethod = kMethodCompleteFile;
    return plan;
}

} // namespace quorvel

#include "fixfiles/CompanyFile.h"

#include "fixfiles/RecordFile.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <sys/stat.h>

namespace dovrel {

void CompanyRecord::setTitle(std::string_view title) {
    if (bytes.size() < kAdfRecordLength)
        bytes.resize(kAdfRecordLength, '\0');
    std::string field(title.substr(0, kCompanyTitleWidth));
    field.resize(kCompanyTitleWidth, ' ');
    bytes.replace(kCompanyTitleOffset, kCompanyTitleWidth, field);
}

std::string CompanyRecord::currencyName(int index) const {
    if (index < 1 || index > static_cast<int>(kCurrencyNames))
        throw Error("Currency name " + std::to_string(index) + " does not exist (1 to 9)");
    size_t offset = kCurrencyNamesOffset + static_cast<size_t>(index - 1) * kCurrencyNameWidth;
    if (offset >= bytes.size())
        return std::string(kCurrencyNameWidth, '\0');
    std::string name = bytes.substr(offset, kCurrencyNameWidth);
    name.resize(kCurrencyNameWidth, '\0');
    return name;
}

std::optional<FileStamp> StampOf(const Path& path) {
    struct stat st {};
    if (::stat(path.c_str(), &st) != 0)
        return std::nullopt;
    return FileStamp{path,
                     static_cast<uint64_t>(st.st_dev),
                     static_cast<uint64_t>(st.st_ino),
                     static_cast<int64_t>(st.st_size),
                     static_cast<int64_t>(st.st_mtim.tv_sec),
                     static_cast<int64_t>(st.st_mtim.tv_nsec)};
}

namespace {

// The file system's name of the company's adf.fix; none when there is none.
std::optional<Path> AdfPath(const Path& pCompPath) {
    Path path = pCompPath.plus("\\adf.fix");
    if (!FileExists(path))
        return std::nullopt;
    return ResolvePath(path);
}

// Reads record 1 of the adf.fix found at path. The stamp is taken before the
// read, so a change made during it shows at the next look.
bool ReadAdfAt(const Path& path, const std::optional<FileStamp>& stamp, CompanyRecord& company) {
    RecordFile file(path, kAdfRecordLength);
    const unsigned char* record = file.record(1);
    if (record == nullptr)
        return false;
    company.bytes.assign(reinterpret_cast<const char*>(record), kAdfRecordLength);
    company.source = stamp;
    return true;
}

} // namespace

bool ReadAdf(const Path& pCompPath, CompanyRecord& company) {
    try {
        std::optional<Path> path = AdfPath(pCompPath);
        return path && ReadAdfAt(*path, StampOf(*path), company);
    } catch (...) {
        return false;
    }
}

bool LoadCompany(const Path& pCompPath, CompanyRecord& company) {
    try {
        std::optional<Path> path = AdfPath(pCompPath);
        if (!path)
            return false;
        std::optional<FileStamp> stamp = StampOf(*path);
        if (stamp && company.source == stamp)
            return true;
        return ReadAdfAt(*path, stamp, company);
    } catch (...) {
        return false;
    }
}

} // namespace dovrel

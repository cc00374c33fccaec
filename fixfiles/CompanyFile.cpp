#include "fixfiles/CompanyFile.h"

#include "fixfiles/RecordFile.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

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

bool ReadAdf(const Path& pCompPath, CompanyRecord& company) {
    try {
        Path path = pCompPath.plus("\\adf.fix");
        if (!FileExists(path))
            return false;
        RecordFile file(ResolvePath(path), kAdfRecordLength);
        const unsigned char* record = file.record(1);
        if (record == nullptr)
            return false;
        company.bytes.assign(reinterpret_cast<const char*>(record), kAdfRecordLength);
        return true;
    } catch (...) {
        return false;
    }
}

} // namespace dovrel

// The automation host: every line of the input is one request to a fresh
// session. "$COMPANY" in a line stands for a small company written once per
// process with the sample-company writer, so requests reach real files.

#include "FuzzSupport.h"

#include "app/session/HostSession.h"
#include "control/ModuleState.h"
#include "tools/SampleWriter.h"

#include <nlohmann/json.hpp>

using namespace dovrel;
using dovrel::fuzz::Require;

namespace {

constexpr const char* kCompany = R"J({
  "company": {"name": "דמו", "title": "דמו בע\"מ", "currencies": ["יורו", "", "ין"]},
  "items": [{"key": "A100", "name": "מסמרים", "category": "01", "foreignName": "Nails"},
            {"key": "b200", "name": "ברגים", "category": "02", "foreignName": "Screws"}],
  "accounts": [{"key": "1001", "name": "לקוח", "phone": "03-1234567", "district": "מרכז",
                "details": "פרטים"}],
  "documents": [
    {"type": 20, "account": "1001", "customer": "כהן (בע\"מ)", "reference": "12",
     "date": "2024-03-15", "lines": [
       {"key": "A100", "description": "מסמרים 5", "details": "x", "price": 10.5, "quantity": 2},
       {"key": "*", "description": "הערה"},
       {"key": "b200", "currency": 10, "price": 3, "quantity": 1, "discount": 12.5}]},
    {"type": 30, "account": "1001", "lines": [{"key": "A100", "price": 1, "quantity": 1}]},
    {"type": 40, "date": "1999-12-31"}
  ]
})J";

const std::string& CompanyDir() {
    static const std::string dir = [] {
        std::string path = fuzz::PrivateDir() + "/company";
        sample::WriteCompany(kCompany, path);
        return path;
    }();
    return dir;
}

std::string WithCompany(std::string_view line) {
    std::string text(line);
    const std::string marker = "$COMPANY";
    for (size_t at = text.find(marker); at != std::string::npos;
         at = text.find(marker, at + CompanyDir().size()))
        text.replace(at, marker.size(), CompanyDir());
    return text;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    std::string_view input(reinterpret_cast<const char*>(data), size);
    ModuleState shared;
    HostSession session(shared);
    size_t start = 0;
    while (start <= input.size()) {
        size_t end = std::min(input.find('\n', start), input.size());
        std::optional<std::string> reply =
            session.handle(WithCompany(input.substr(start, end - start)));
        if (reply) {
            nlohmann::json answer = nlohmann::json::parse(*reply, nullptr, false);
            Require(answer.is_object() && answer.contains("ok"),
                    "every answer is an object with ok");
        }
        start = end + 1;
    }
    return 0;
}

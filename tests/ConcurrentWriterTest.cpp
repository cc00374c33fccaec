// The document reader on a file that another process rewrites, extends and
// shortens while the reader walks it in every direction.
//
// The file holds a filler record, then documents of five records (header,
// continuation, three line slots). Every write copies, offset for offset, one of
// three images that differ in references, dates and lines but give the document
// at slot k the same account and customer; so a document shown must carry those
// and a reference of its slot. A record met half-written (the writer never
// writes a zero byte in a text) may show zeros, or the reader reports line
// number 0; both are counted and must stay rare.

#include "TestCompany.h"
#include "control/Card.h"
#include "fixfiles/ReadStock.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <fcntl.h>
#include <signal.h>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <time.h>
#include <unistd.h>

#include <atomic>
#include <filesystem>
#include <fstream>
#include <new>
#include <set>

namespace dovrel {
namespace {

using nlohmann::json;
using test::U;
using test::W;
using Result = ::testing::AssertionResult;

constexpr int16_t kDeliveryRow = 13; // type 20, ISHP.FIX
constexpr int64_t kRec = kDocRecordLength;
constexpr int kLineSlots = 3;
constexpr int64_t kDocRecords = 2 + kLineSlots;
constexpr int64_t kDocBytes = kDocRecords * kRec;
constexpr int kDocs = 40;
constexpr int kVariants = 3;

const std::pair<const char*, const char*> kParties[] = {
    {"1001", "משה כהן"}, {"2002", "Levi & Sons"}, {"3003", "אור \"הצפון\" בע\"מ"}, {"44", "דנה"}};

int64_t DocOffset(int64_t k) {
    return kRec + k * kDocBytes;
}
const auto& PartyOf(int64_t k) {
    return kParties[k % std::size(kParties)];
}
std::string ReferenceOf(int variant, int64_t k) {
    return std::to_string(variant) + "-" + std::to_string(k);
}

// Variant v has 3 - v lines per document; unused line slots are fillers.
std::string MakeImage(int variant) {
    json documents = json::array();
    int lines = kLineSlots - variant;
    for (int k = 0; k < kDocs; ++k) {
        std::vector<json> list;
        for (int i = 0; i < lines; ++i)
            list.push_back(test::Line(std::string("A1B2C3").substr((i + variant) % 3 * 2, 2),
                                      "שורה " + std::to_string(i), 10 + variant, 1 + i));
        documents.push_back(test::Doc(20, ReferenceOf(variant, k), PartyOf(k).second, list));
        documents.back()["account"] = PartyOf(k).first;
        documents.back()["date"] = "2024-01-0" + std::to_string(variant + 1);
        if (lines < kLineSlots)
            documents.push_back({{"file", "ISHP.FIX"}, {"filler", kLineSlots - lines}});
    }
    test::TestCompany company(json{{"documents", documents}}.dump());
    return test::ReadAll(company.file("ISHP.FIX"));
}

uint64_t NextRandom(uint64_t& state) {
    state ^= state << 13;
    state ^= state >> 7;
    state ^= state << 17;
    return state;
}

// Counters in memory shared by the two processes.
struct Progress {
    std::atomic<bool> started{false};
    std::atomic<uint64_t> operations{0};
};

// The writer process: only pwrite and ftruncate on its own descriptor, no
// allocation. Runs until killed; the alarm and the parent-death signal end it
// if the test itself dies.
struct Writer {
    int fd;
    const std::string* images;
    int64_t size;
    Progress& progress;

    [[noreturn]] void run() {
        prctl(PR_SET_PDEATHSIG, SIGKILL);
        alarm(120);
        progress.started.store(true);
        uint64_t random = 0x9E3779B97F4A7C15ULL;
        const timespec pause{0, 20'000};
        for (;; nanosleep(&pause, nullptr)) {
            uint64_t what = NextRandom(random) % 8;
            if (!step(what, NextRandom(random)))
                _exit(3);
            progress.operations.fetch_add(1);
        }
    }

    // Documents whose header starts before the end of the file.
    int64_t docs() const { return size <= kRec ? 0 : (size - kRec + kDocBytes - 1) / kDocBytes; }
    bool copy(int variant, int64_t offset, int64_t length) {
        size = std::max(size, offset + length);
        return ::pwrite(fd, images[variant].data() + offset, static_cast<size_t>(length), offset) ==
               length;
    }
    bool shorten(int64_t length) {
        if (length >= size)
            return true;
        size = length;
        return ::ftruncate(fd, length) == 0;
    }

    bool step(uint64_t what, uint64_t r) {
        int variant = static_cast<int>(r % kVariants);
        r /= kVariants;
        int64_t k = docs() == 0 ? 0 : static_cast<int64_t>(r % static_cast<uint64_t>(docs()));
        if (what < 3) // rewrite one document in place
            return docs() == 0 || copy(variant, DocOffset(k), kDocBytes);
        if (what < 5) { // complete the last document, or append the next one
            int64_t next = size <= kRec ? 0 : (size - kRec) / kDocBytes;
            return next >= kDocs || ((size >= kRec || copy(variant, 0, kRec)) &&
                                     copy(variant, DocOffset(next), kDocBytes));
        }
        if (what == 5) // cut into the lines of a document, mid-record too
            return shorten(DocOffset(k) + 2 * kRec + static_cast<int64_t>(r % (kLineSlots * kRec)));
        if (what == 6) // cut at a document's start
            return shorten(DocOffset(k));
        // cut back to the first record and write the file anew
        return shorten(kRec) && copy(variant, 0, DocOffset(static_cast<int64_t>(r % kDocs) + 1));
    }
};

// This process's descriptors open on the file: how many, and how many of them
// are open for anything but reading.
std::pair<int, int> OpenFds(const std::filesystem::path& file) {
    std::pair<int, int> found{0, 0};
    std::error_code ec;
    for (const auto& entry : std::filesystem::directory_iterator("/proc/self/fd", ec)) {
        if (std::filesystem::read_symlink(entry.path(), ec) != file)
            continue;
        ++found.first;
        std::ifstream info("/proc/self/fdinfo/" + entry.path().filename().string());
        std::string key, value;
        while (info >> key >> value && key != "flags:") {
        }
        if (key != "flags:" || (std::stol(value, nullptr, 8) & O_ACCMODE) != O_RDONLY)
            ++found.second;
    }
    return found;
}

// The writer never writes a zero byte in a text; the reader shows one as U+FFFD.
bool HalfWritten(const std::string& utf8) {
    return utf8.find("\xEF\xBF\xBD") != std::string::npos;
}

struct Search {
    std::string by, value, fromDate; // the value in UTF-8
};

class ConcurrentWriterTest : public ::testing::Test {
protected:
    void SetUp() override {
        for (int v = 0; v < kVariants; ++v) {
            images[v] = MakeImage(v);
            ASSERT_EQ(static_cast<int64_t>(images[v].size()), DocOffset(kDocs));
        }
        file = dir.path() / "ISHP.FIX";
        std::ofstream(file, std::ios::binary) << images[0];
        file = std::filesystem::canonical(file);
        void* shared = mmap(nullptr, sizeof(Progress), PROT_READ | PROT_WRITE,
                            MAP_SHARED | MAP_ANONYMOUS, -1, 0);
        ASSERT_NE(shared, MAP_FAILED);
        progress = new (shared) Progress;
        // The writer's descriptor is opened before the file is made read-only
        // for everybody, so the reader could not open it for writing.
        int fd = ::open(file.c_str(), O_RDWR | O_CLOEXEC);
        ASSERT_GE(fd, 0);
        child = fork();
        ASSERT_GE(child, 0);
        if (child == 0)
            Writer{fd, images, static_cast<int64_t>(images[0].size()), *progress}.run();
        ::close(fd);
        ASSERT_EQ(chmod(file.c_str(), 0444), 0);
        for (int i = 0; i < 10'000 && !progress->started.load(); ++i)
            usleep(1000);
        ASSERT_TRUE(progress->started.load()) << "the writer did not start";
    }
    void TearDown() override {
        if (child > 0) {
            kill(child, SIGKILL);
            waitpid(child, nullptr, 0);
        }
        munmap(progress, sizeof(Progress));
    }

    Result scan(std::string direction, const Search& search);
    Result checkDocument(const Search& search);

    test::TempDir dir;
    std::filesystem::path file;
    std::string images[kVariants];
    Progress* progress = nullptr;
    pid_t child = -1;

    ModuleState state;
    RecordedMessages messages;
    Card card{messages, state};
    int found = 0, empty = 0;
    int halfWritten = 0; // scans that met a record half-written
};

Result ConcurrentWriterTest::scan(std::string direction, const Search& search) {
    card.PubSearchBy = search.by;
    card.PubSearchValue = Variant(W(search.value));
    card.txtItemKey.setText(W(search.value));
    card.txtAccountKey.setText(""); // an item search would keep to the account shown
    card.PubPrevLocation = 0;
    int16_t row = kDeliveryRow;
    std::string fromDate = search.fromDate;
    card.ReadStock(FromUtf8(Utf8(dir.str())), row, card.PubSearchBy, card.PubSearchValue, direction,
                   fromDate);
    if (!messages.shown().empty()) {
        std::string text = U(messages.take().back().text);
        halfWritten += text.starts_with("Line number 0 ");
        return text.starts_with("Line number 0 ") ? ::testing::AssertionSuccess()
                                                  : ::testing::AssertionFailure() << text;
    }
    if (card.ProgressFill.Width() != 0)
        return ::testing::AssertionFailure() << "the progress bar is left filled";
    if (card.PubPrevLocation != 0)
        return ++found, checkDocument(search);
    ++empty;
    for (const TextBox* box : {&card.txtAccountKey, &card.txtReference1, &card.txtCustomerName,
                               &card.txtDate, &card.txtTotal1})
        if (!box->Text().empty())
            return ::testing::AssertionFailure() << box->name() << " kept " << U(box->Text());
    if (card.DocLines.Rows() != 2)
        return ::testing::AssertionFailure()
               << "empty view has " << card.DocLines.Rows() << " rows";
    return ::testing::AssertionSuccess();
}

// Whether a line of the grid has the item key: a document found by one of its
// lines shows all of them.
bool HasLineKey(const Grid& lines, const std::string& key) {
    for (int32_t row = 1; row + 1 < lines.Rows(); ++row)
        if (lines.TextMatrix(row, 1) == key)
            return true;
    return false;
}

Result ConcurrentWriterTest::checkDocument(const Search& search) {
    int64_t at = card.PubACTLocation;
    if (at != card.PubPrevLocation || at < 2 || (at - 2) % kDocRecords != 0)
        return ::testing::AssertionFailure() << "document shown at record " << at;
    int64_t k = (at - 2) / kDocRecords;
    std::string account = U(card.txtAccountKey.Text()), customer = U(card.txtCustomerName.Text()),
                reference = U(card.txtReference1.Text()), date = U(card.txtDate.Text());
    bool torn = false;
    auto fits = [&](bool written, bool withZeros) {
        torn = torn || (!written && withZeros);
        return written || withZeros;
    };
    bool dateFits = date == "01/01/2024" || date == "02/01/2024" || date == "03/01/2024";
    const std::set<std::string> references{ReferenceOf(0, k), ReferenceOf(1, k), ReferenceOf(2, k)};
    // Zero bytes in a date make a year of 1900 or before.
    if (!fits(account == PartyOf(k).first, HalfWritten(account)) ||
        !fits(customer == PartyOf(k).second, HalfWritten(customer)) ||
        !fits(references.contains(reference), HalfWritten(reference)) ||
        !fits(dateFits, date.size() == 10 && date.substr(6) <= "1900"))
        return ::testing::AssertionFailure() << "record " << at << ": " << account << " / "
                                             << customer << " / " << reference << " / " << date;
    if (!search.fromDate.empty() && date == "01/01/2024")
        return ::testing::AssertionFailure() << "date " << date << " before the from-date";
    if (card.DocLines.Rows() < 2 || card.DocLines.Rows() > 2 + kLineSlots)
        return ::testing::AssertionFailure() << card.DocLines.Rows() << " grid rows";
    for (int32_t line = 1; line + 1 < card.DocLines.Rows(); ++line) {
        std::string key = U(card.DocLines.TextMatrix(line, 1));
        if (!fits(key == "A1" || key == "B2" || key == "C3", HalfWritten(key)))
            return ::testing::AssertionFailure() << "line key " << key;
    }
    bool matches =
        search.by.empty() || (search.by == "AccountKey" && account == search.value) ||
        (search.by == "CustomerName" && customer.find(search.value) != std::string::npos) ||
        (search.by == "Reference1" && reference == search.value) ||
        (search.by == "ItemKey" && HasLineKey(card.DocLines, search.value));
    if (!matches && !torn)
        return ::testing::AssertionFailure()
               << "does not match " << search.by << " " << search.value;
    halfWritten += torn ? 1 : 0;
    return ::testing::AssertionSuccess();
}

TEST_F(ConcurrentWriterTest, ScansEndWithAWholeDocumentOrNothingAndNeverWrite) {
    std::pair<int, int> duringScans{0, 0};
    int progressChecks = 0;
    Connection watching = card.ProgressFill.changed.connect([&] {
        if (++progressChecks % 4 != 0)
            return;
        auto [count, writable] = OpenFds(file);
        duringScans.first += count;
        duringScans.second += writable;
    });

    const Search searches[] = {{"", "", ""},
                               {"AccountKey", "2002", ""},
                               {"CustomerName", "כהן", ""},
                               {"Reference1", "1-9", ""},
                               {"ItemKey", "B2", ""},
                               {"", "", "02/01/2024"},
                               {"CustomerName", "הצפון", "03/01/2024"}};
    uint64_t random = 12345;
    for (int round = 0; round < 120; ++round) {
        for (const char* direction :
             {"First", "Next", "Next", "Last", "Previous", "Previous", "Next"}) {
            ASSERT_TRUE(scan(direction, searches[round % std::size(searches)]))
                << direction << " in round " << round;
            ASSERT_EQ(OpenFds(file).first, 0) << "the file stays open after a scan";
        }
        // Now and then start from anywhere, past the end of the file too.
        card.PubACTLocation = static_cast<int32_t>(NextRandom(random) % (kDocs * kDocRecords + 40));
    }

    EXPECT_GT(found, 0);
    EXPECT_GT(empty, 0);
    EXPECT_LE(halfWritten * 100, found + empty) << "half-written records are rare";
    EXPECT_GT(duringScans.first, 0) << "the file was never seen open during a scan";
    EXPECT_EQ(duringScans.second, 0) << "the reader opened the file for writing";
    EXPECT_GT(progress->operations.load(), 100u) << "the writer hardly ran";
    EXPECT_EQ(waitpid(child, nullptr, WNOHANG), 0) << "the writer stopped early";
}

} // namespace
} // namespace dovrel

#include "app/cli/ChromiumPdf.h"

#include "platform/Error.h"

#include <cctype>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <system_error>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

extern char** environ;

namespace dovrel {

namespace fs = std::filesystem;

namespace {

// A file URL for an absolute path: every byte but the unreserved ones and
// "/" written as %XX, so that any name reaches Chromium unchanged.
std::string FileUrl(const std::string& path) {
    static const char hex[] = "0123456789ABCDEF";
    std::string url = "file://";
    for (unsigned char c : path) {
        if (std::isalnum(c) || c == '/' || c == '-' || c == '_' || c == '.' || c == '~') {
            url += static_cast<char>(c);
        } else {
            url += '%';
            url += hex[c >> 4];
            url += hex[c & 15];
        }
    }
    return url;
}

// The page asks for A4 paper: Chromium's own default is US Letter.
void AskForA4(const std::string& page) {
    std::string text;
    {
        std::ifstream in(page, std::ios::binary);
        text.assign(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
    }
    const std::string style = "<style>@page { size: A4; }</style>";
    size_t head = text.find("<HEAD>");
    text.insert(head == std::string::npos ? 0 : head + 6, style);
    std::ofstream out(page, std::ios::binary | std::ios::trunc);
    out << text;
    if (!out.flush())
        throw Error("Cannot prepare the page for Chromium: " + Path(page).shown().str());
}

std::string MakeRoot() {
    std::string pattern = (fs::temp_directory_path() / "dovrel-pdf-XXXXXX").string();
    if (::mkdtemp(pattern.data()) == nullptr)
        throw Error(std::string("Cannot make a temporary folder for Chromium: ") +
                    std::strerror(errno));
    return pattern;
}

// The PDF in its place: renamed when on the same file system, else copied
// beside it under a temporary name and then renamed, so it is never partial.
void MoveInPlace(const std::string& from, const Path& to) {
    std::error_code ec;
    fs::rename(from, to.native(), ec);
    if (!ec)
        return;
    std::string part = to.native() + ".part";
    fs::copy_file(from, part, fs::copy_options::overwrite_existing, ec);
    if (!ec)
        fs::rename(part, to.native(), ec);
    if (ec) {
        fs::remove(part);
        throw Error("Cannot write " + to.shown().str() + ": " + ec.message());
    }
}

} // namespace

std::optional<std::string> ChromiumPdf::Find() {
    const char* path = std::getenv("PATH");
    std::istringstream folders(path ? path : "/usr/bin:/bin");
    for (std::string folder; std::getline(folders, folder, ':');) {
        std::string program = (folder.empty() ? "." : folder) + "/chromium";
        if (::access(program.c_str(), X_OK) == 0 && fs::is_regular_file(program))
            return program;
    }
    return std::nullopt;
}

ChromiumPdf::ChromiumPdf(std::string program, size_t maxRunning, std::chrono::seconds timeout)
    : program_(std::move(program)), maxRunning_(maxRunning < 1 ? 1 : maxRunning), timeout_(timeout),
      root_(MakeRoot()) {}

ChromiumPdf::~ChromiumPdf() {
    for (const Job& job : running_) {
        ::kill(-job.pid, SIGKILL);
        ::waitpid(job.pid, nullptr, 0);
    }
    std::error_code ec;
    fs::remove_all(root_, ec);
}

Path ChromiumPdf::pagePath() {
    std::string folder = root_ + "/" + std::to_string(++pages_);
    fs::create_directory(folder);
    return Path(folder + "/page.htm");
}

void ChromiumPdf::print(const Path& page, const Path& pdf) {
    while (running_.size() >= maxRunning_)
        reap(true);
    AskForA4(page.native());
    std::string folder = fs::path(page.native()).parent_path().string();
    std::vector<std::string> words = {program_,
                                      "--headless",
                                      "--disable-gpu",
                                      "--no-first-run",
                                      "--no-default-browser-check",
                                      "--disable-extensions",
                                      "--user-data-dir=" + folder + "/profile",
                                      "--no-pdf-header-footer",
                                      "--print-to-pdf=" + folder + "/page.pdf",
                                      FileUrl(page.native())};
    // Chromium refuses to run as root with its sandbox.
    if (::geteuid() == 0)
        words.insert(words.begin() + 1, "--no-sandbox");
    std::vector<char*> argv;
    for (std::string& word : words)
        argv.push_back(word.data());
    argv.push_back(nullptr);

    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_addopen(&files, 0, "/dev/null", O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&files, 1, (folder + "/chromium.log").c_str(),
                                     O_WRONLY | O_CREAT | O_TRUNC, 0600);
    posix_spawn_file_actions_adddup2(&files, 1, 2);
    posix_spawnattr_t attributes;
    posix_spawnattr_init(&attributes);
    // A group of its own, so that a stopped Chromium takes its helpers along.
    posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETPGROUP);
    posix_spawnattr_setpgroup(&attributes, 0);
    pid_t pid = -1;
    int failed = posix_spawn(&pid, program_.c_str(), &files, &attributes, argv.data(), environ);
    posix_spawn_file_actions_destroy(&files);
    posix_spawnattr_destroy(&attributes);
    if (failed != 0) {
        outcome_.failures.push_back(pdf.shown().str() +
                                    ": cannot start Chromium: " + std::strerror(failed));
        return;
    }
    running_.push_back({pid, std::chrono::steady_clock::now() + timeout_, folder, pdf});
}

void ChromiumPdf::reap(bool block) {
    while (!running_.empty()) {
        for (size_t i = 0; i < running_.size(); ++i) {
            Job job = running_[i];
            int status = 0;
            pid_t done = ::waitpid(job.pid, &status, WNOHANG);
            bool late = done == 0 && std::chrono::steady_clock::now() > job.deadline;
            if (done == 0 && !late)
                continue;
            if (late) {
                ::kill(-job.pid, SIGKILL);
                ::waitpid(job.pid, &status, 0);
                outcome_.failures.push_back(job.pdf.shown().str() + ": Chromium took longer than " +
                                            std::to_string(timeout_.count()) +
                                            " seconds and was stopped");
            } else {
                complete(job, status);
            }
            running_.erase(running_.begin() + static_cast<std::ptrdiff_t>(i));
            std::error_code ec;
            fs::remove_all(job.folder, ec);
            return;
        }
        if (!block)
            return;
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
}

void ChromiumPdf::complete(const Job& job, int status) {
    std::string made = job.folder + "/page.pdf";
    std::error_code ec;
    bool ok = WIFEXITED(status) && WEXITSTATUS(status) == 0 && fs::file_size(made, ec) > 0 && !ec;
    if (!ok) {
        outcome_.failures.push_back(
            job.pdf.shown().str() + ": Chromium did not print the page (exit " +
            (WIFEXITED(status) ? std::to_string(WEXITSTATUS(status)) : std::string("by a signal")) +
            ")");
        return;
    }
    try {
        MoveInPlace(made, job.pdf);
        outcome_.made.push_back(job.pdf);
    } catch (const std::exception& e) {
        outcome_.failures.push_back(e.what());
    }
}

ChromiumPdf::Outcome ChromiumPdf::finish() {
    while (!running_.empty())
        reap(true);
    return std::exchange(outcome_, {});
}

} // namespace dovrel

#pragma once

#include "platform/Path.h"

#include <chrono>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include <sys/types.h>

namespace dovrel {

// Turns written pages into PDF files with headless Chromium, A4, without the
// browser's own header and footer. Each Chromium runs with a profile folder
// of its own in a private temporary folder, which is removed with this
// object; at most maxRunning of them run at once, and one that takes longer
// than the timeout is stopped with everything it started.
class ChromiumPdf {
public:
    // The chromium program found on PATH; none when it is not installed.
    static std::optional<std::string> Find();

    ChromiumPdf(std::string program, size_t maxRunning,
                std::chrono::seconds timeout = std::chrono::seconds(60));
    ~ChromiumPdf();
    ChromiumPdf(const ChromiumPdf&) = delete;
    ChromiumPdf& operator=(const ChromiumPdf&) = delete;

    // A new path in the private folder to write a page at, for print().
    Path pagePath();
    // Starts printing the page (a path from pagePath) into pdf, after
    // waiting for a free place. The PDF appears at pdf only when whole.
    void print(const Path& page, const Path& pdf);
    struct Outcome {
        std::vector<Path> made;
        std::vector<std::string> failures; // each naming the PDF and why, UTF-8
    };
    // Waits for every print started since the last call.
    Outcome finish();

private:
    struct Job {
        pid_t pid = -1;
        std::chrono::steady_clock::time_point deadline;
        std::string folder; // the job's own folder: profile, page and PDF
        Path pdf;
    };

    // Waits until a job ends (or none runs); block=false only looks.
    void reap(bool block);
    void complete(const Job& job, int status);

    std::string program_;
    size_t maxRunning_;
    std::chrono::seconds timeout_;
    std::string root_;
    size_t pages_ = 0;
    std::vector<Job> running_;
    Outcome outcome_;
};

} // namespace dovrel

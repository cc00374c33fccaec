#pragma once

#include "platform/Path.h"

#include <string>
#include <string_view>

namespace dovrel {

// A page being written: lines gathered in memory, each ended by CR LF, then
// written to a new file beside the target and renamed over it. A page that
// is not committed leaves nothing behind, and whatever was at the target
// stays as it was until the new page is complete.
class PageFile {
public:
    explicit PageFile(Path path) : path_(std::move(path)) {}

    void line(std::string_view text) {
        text_ += text;
        text_ += "\r\n";
    }
    const std::string& text() const { return text_; }
    const Path& path() const { return path_; }

    // Writes the page; an error names the file and the cause.
    void commit() const;

private:
    Path path_;
    std::string text_;
};

// The private directory of this user's pages under the temporary directory
// ($TMPDIR, else /tmp): made with mode 0700 when missing; refused when it is
// a link, not a directory, not the user's own or open to others.
Path PrivatePageDir();

// Where the print button writes its page: "dvprint.htm" in that directory.
Path PrintFilePath();

} // namespace dovrel

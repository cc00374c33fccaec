#pragma once

#include <string>
#include <string_view>

namespace dovrel {

// A page being written: lines gathered in memory, each ended by CR LF, then
// written to a new file beside the target and renamed over it. A page that
// is not committed leaves nothing behind, and whatever was at the target
// stays as it was until the new page is complete.
class PageFile {
public:
    // The path is code page 1255, as every path the control is given.
    explicit PageFile(std::string path) : path_(std::move(path)) {}

    void line(std::string_view text) {
        text_ += text;
        text_ += "\r\n";
    }
    const std::string& text() const { return text_; }
    const std::string& path() const { return path_; }

    // Writes the page; an error names the file and the cause.
    void commit() const;

private:
    std::string path_;
    std::string text_;
};

// The private directory of this user's pages under the temporary directory
// ($TMPDIR, else /tmp): made with mode 0700 when missing; refused when it is
// a link, not a directory, not the user's own or open to others.
std::string PrivatePageDir();

// Where the print button writes its page: "dvprint.htm" in that directory,
// in code page 1255 as the control's paths are.
std::string PrintFilePath();

} // namespace dovrel

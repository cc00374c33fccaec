#pragma once

#include <string>

namespace dovrel {

// The way from a page's session to the page: its messages, one JSON object
// each, and the end of the page. Called from the session's thread; neither
// waits for the page.
class PageLink {
public:
    virtual ~PageLink() = default;
    virtual void send(std::string message) = 0;
    // The session has ended: the page is told by its connection closing.
    virtual void close() = 0;
};

} // namespace dovrel

#include "app/web/WebSession.h"
#include "TestCompany.h"

#include <gtest/gtest.h>

#include <chrono>
#include <condition_variable>
#include <deque>
#include <mutex>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TestCompany;

const char* const kCompany = R"({
  "company": {"title": "דמו"},
  "accounts": [{"key": "1001", "phone": "03-1234567"}],
  "documents": [{"type": 20, "customer": "משה כהן", "lines": [{"key": "A1", "price": 5, "quantity": 1}]},
                {"type": 20, "customer": "דנה לוי", "lines": [{"key": "B2", "price": 7, "quantity": 2}]}]})";

// The page's end of a session, without sockets: what the session sends
// waits here until the test takes it.
class FakePage : public PageLink {
public:
    struct Shared {
        std::mutex mutex;
        std::condition_variable arrived;
        std::deque<json> messages;
        bool closed = false;
    };
    explicit FakePage(std::shared_ptr<Shared> shared) : shared_(std::move(shared)) {}
    void send(std::string message) override {
        std::lock_guard lock(shared_->mutex);
        shared_->messages.push_back(json::parse(message));
        shared_->arrived.notify_all();
    }
    void close() override {
        std::lock_guard lock(shared_->mutex);
        shared_->closed = true;
        shared_->arrived.notify_all();
    }

private:
    std::shared_ptr<Shared> shared_;
};

class WebSessionTest : public ::testing::Test {
protected:
    void open(std::vector<std::string> roots) {
        WebSession::Options options;
        options.roots = std::move(roots);
        session = std::make_unique<WebSession>(options, std::make_unique<FakePage>(page), prints);
        hello = next("hello");
    }
    // The next message the page gets, which must be of that type.
    json next(const std::string& type) {
        std::unique_lock lock(page->mutex);
        bool came = page->arrived.wait_for(lock, std::chrono::seconds(20),
                                           [&] { return !page->messages.empty(); });
        if (!came)
            return {{"type", "nothing came"}};
        json message = page->messages.front();
        page->messages.pop_front();
        EXPECT_EQ(message["type"], type) << message;
        return message;
    }
    json ask(const json& request) {
        session->deliver(json{{"type", "request"}, {"id", ++id}, {"request", request}}.dump());
        return next("reply");
    }
    bool closed() {
        std::unique_lock lock(page->mutex);
        return page->arrived.wait_for(lock, std::chrono::seconds(20), [&] { return page->closed; });
    }

    std::shared_ptr<FakePage::Shared> page = std::make_shared<FakePage::Shared>();
    PrintStore prints;
    std::unique_ptr<WebSession> session;
    json hello;
    int id = 0;
};

TEST_F(WebSessionTest, RequestsRunInOrderAndAnswerWithTheState) {
    TestCompany company(kCompany);
    open({company.path().string()});
    EXPECT_FALSE(hello["design"]["card"]["controls"].empty());
    EXPECT_TRUE(hello["design"]["forms"].contains("frmItemPics"));
    EXPECT_EQ(hello["state"]["controls"]["txtCustomerName"], "");

    json shown = ask({"call", "ShowDoc", company.path().string(), 20, 1});
    ASSERT_EQ(shown["ok"], true) << shown;
    EXPECT_EQ(shown["id"], 1);
    std::string first = shown["state"]["controls"]["txtCustomerName"];
    json moved = ask({"click", "NextButt"});
    EXPECT_NE(moved["state"]["controls"]["txtCustomerName"], first);
    EXPECT_EQ(ask({"click", "PrevButt"})["state"]["controls"]["txtCustomerName"], first);

    // What only the automation host may do is refused, and the session goes on.
    for (const json& refused : {json{"new"}, json{"answers", json::array()},
                                json{"call", "ReadITM", "/"}, json{"modal", "x", json::array()}})
        EXPECT_EQ(ask(refused)["ok"], false) << refused;
    EXPECT_EQ(ask({"state"})["ok"], true);
}

TEST_F(WebSessionTest, AMessageBoxBlocksTheSessionUntilThePageAnswers) {
    TestCompany empty(R"({"company": {"title": "x"}})");
    TestCompany other(kCompany);
    open({empty.path().string()});
    session->deliver(json{{"type", "request"},
                          {"id", 1},
                          {"request", {"call", "ShowDoc", empty.path().string(), 20, 1}}}
                         .dump());
    json box = next("message");
    EXPECT_EQ(box["text"], "קבצי מסמכים לא נמצאו");
    EXPECT_EQ(box["buttons"], "ok");
    // The box is modal: the page's other requests wait their turn no more.
    EXPECT_EQ(ask({"click", "NextButt"})["error"], "A message box is shown");
    session->deliver(R"({"type": "answer", "answer": "ok"})");
    EXPECT_EQ(next("reply")["id"], 1);

    // A company outside the served folder gets the control's own message,
    // as a missing one does, and nothing of it is read.
    session->deliver(json{{"type", "request"},
                          {"id", 2},
                          {"request", {"call", "ShowDoc", other.path().string(), 20, 1}}}
                         .dump());
    EXPECT_EQ(next("message")["text"], "קבצי מסמכים לא נמצאו");
    session->deliver(R"({"type": "answer", "answer": "ok"})");
    EXPECT_EQ(next("reply")["state"]["controls"]["txtCustomerName"], "");
}

TEST_F(WebSessionTest, AFormTakesOnlyItsOwnControlsAndAPageGoneClosesIt) {
    TestCompany company(kCompany);
    open({company.path().string()});
    session->deliver(R"({"type": "request", "id": 7, "request": ["click", "CmdParams"]})");
    json form = next("form");
    EXPECT_EQ(form["name"], "frmItemPics");
    EXPECT_TRUE(form["state"]["forms"]["frmItemPics"]["controls"].contains("ItemPicLines"));
    EXPECT_EQ(ask({"click", "NextButt"})["error"], "A form is shown");
    EXPECT_EQ(ask({"state"})["state"]["forms"]["frmItemPics"]["visible"], true);
    session->deliver(R"({"type": "close"})");
    EXPECT_EQ(next("formClosed")["name"], "frmItemPics");
    EXPECT_EQ(next("reply")["id"], 7);

    session->deliver(R"({"type": "request", "id": 8, "request": ["click", "CmdDir"]})");
    EXPECT_EQ(next("form")["name"], "frmOpenDir");
    session->gone();
    EXPECT_EQ(next("formClosed")["name"], "frmOpenDir");
    EXPECT_TRUE(closed());
    session.reset();
}

} // namespace
} // namespace dovrel

// Many pages at once against `dovrel serve`: starts the server over the demo
// company on a free loopback port, opens CLIENTS WebSockets at once, and has
// each show the first delivery note and click next and previous CLICKS times,
// one click waiting for the answer before the next. Prints the clicks a
// second, the 50th and 99th percentile of a click's round trip, the errors,
// and the server's peak resident memory.
//
// dovrel-serve-bench DOVREL DEMO_DIR [CLIENTS [CLICKS]]

#include <boost/asio/ip/tcp.hpp>
#include <boost/beast/core.hpp>
#include <boost/beast/websocket.hpp>
#include <nlohmann/json.hpp>

#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iostream>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

namespace beast = boost::beast;
namespace websocket = beast::websocket;
namespace net = boost::asio;
using nlohmann::json;
using Clock = std::chrono::steady_clock;

extern char** environ;

namespace {

std::mutex gMutex;
std::vector<double> gTrips; // milliseconds
std::atomic<int> gErrors{0};

// Reads messages until the reply to the request of that id.
void AwaitReply(websocket::stream<beast::tcp_stream>& ws, int id) {
    for (;;) {
        beast::flat_buffer buffer;
        ws.read(buffer);
        json message = json::parse(beast::buffers_to_string(buffer.data()));
        if (message["type"] == "reply" && message["id"] == id) {
            if (message["ok"] != true)
                ++gErrors;
            return;
        }
        if (message["type"] == "message")
            ws.write(net::buffer(std::string(R"({"type":"answer","answer":"ok"})")));
    }
}

void Page(unsigned short port, const std::string& demo, int clicks) {
    try {
        net::io_context context;
        websocket::stream<beast::tcp_stream> ws(context);
        beast::get_lowest_layer(ws).expires_after(std::chrono::seconds(300));
        beast::get_lowest_layer(ws).connect({net::ip::make_address("127.0.0.1"), port});
        std::string host = "127.0.0.1:" + std::to_string(port);
        ws.set_option(websocket::stream_base::decorator([host](websocket::request_type& request) {
            request.set(beast::http::field::origin, "http://" + host);
        }));
        ws.handshake(host, "/ws");
        beast::flat_buffer hello;
        ws.read(hello);
        int id = 0;
        auto ask = [&](const json& request) {
            ws.write(
                net::buffer(json{{"type", "request"}, {"id", ++id}, {"request", request}}.dump()));
            AwaitReply(ws, id);
        };
        ask({"call", "ShowDoc", demo, 20, 2});
        std::vector<double> trips;
        for (int i = 0; i < clicks; ++i) {
            auto start = Clock::now();
            ask({"click", i % 2 == 0 ? "NextButt" : "PrevButt"});
            trips.push_back(
                std::chrono::duration<double, std::milli>(Clock::now() - start).count());
        }
        ws.close(websocket::close_code::normal);
        std::lock_guard lock(gMutex);
        gTrips.insert(gTrips.end(), trips.begin(), trips.end());
    } catch (const std::exception& e) {
        ++gErrors;
        std::lock_guard lock(gMutex);
        std::cerr << "a page failed: " << e.what() << '\n';
    }
}

long PeakKiB(pid_t pid) {
    std::ifstream status("/proc/" + std::to_string(pid) + "/status");
    std::string line;
    while (std::getline(status, line))
        if (line.starts_with("VmHWM:"))
            return std::stol(line.substr(6));
    return -1;
}

} // namespace

int main(int argc, char** argv) {
    if (argc < 3) {
        std::cerr << "usage: dovrel-serve-bench DOVREL DEMO_DIR [CLIENTS [CLICKS]]\n";
        return 2;
    }
    std::string dovrel = argv[1], demo = argv[2];
    int clients = argc > 3 ? std::clamp(std::atoi(argv[3]), 1, 200) : 50;
    int clicks = argc > 4 ? std::clamp(std::atoi(argv[4]), 1, 10000) : 200;

    // The server's settings go to a folder of their own, not the user's.
    char config[] = "/tmp/dovrel-serve-bench-XXXXXX";
    if (mkdtemp(config) == nullptr)
        return 1;
    setenv("XDG_CONFIG_HOME", config, 1);
    int out[2];
    if (pipe(out) != 0)
        return 1;
    posix_spawn_file_actions_t files;
    posix_spawn_file_actions_init(&files);
    posix_spawn_file_actions_adddup2(&files, out[1], 1);
    posix_spawn_file_actions_addopen(&files, 2, "/dev/null", O_WRONLY, 0);
    std::string sessions = std::to_string(clients + 8);
    std::vector<std::string> words = {dovrel,     "serve",       "--root",         demo,
                                      "--listen", "127.0.0.1:0", "--max-sessions", sessions};
    std::vector<char*> args;
    for (std::string& word : words)
        args.push_back(word.data());
    args.push_back(nullptr);
    pid_t pid;
    if (posix_spawn(&pid, dovrel.c_str(), &files, nullptr, args.data(), environ) != 0)
        return 1;
    close(out[1]);
    std::string url;
    char c;
    while (read(out[0], &c, 1) == 1 && c != '\n')
        url += c;
    unsigned short port = static_cast<unsigned short>(std::stoi(url.substr(url.rfind(':') + 1)));

    auto start = Clock::now();
    std::vector<std::thread> pages;
    for (int i = 0; i < clients; ++i)
        pages.emplace_back(Page, port, demo, clicks);
    for (std::thread& page : pages)
        page.join();
    double seconds = std::chrono::duration<double>(Clock::now() - start).count();
    long peak = PeakKiB(pid);
    kill(pid, SIGTERM);
    waitpid(pid, nullptr, 0);
    std::filesystem::remove_all(config);

    std::sort(gTrips.begin(), gTrips.end());
    auto percentile = [](double p) {
        return gTrips.empty() ? 0.0 : gTrips[static_cast<size_t>(p * double(gTrips.size() - 1))];
    };
    std::printf("pages %d, clicks each %d\n", clients, clicks);
    std::printf("clicks a second   %.0f\n", double(gTrips.size()) / seconds);
    std::printf("round trip p50    %.2f ms\n", percentile(0.50));
    std::printf("round trip p99    %.2f ms\n", percentile(0.99));
    std::printf("errors            %d\n", gErrors.load());
    std::printf("server peak RSS   %.1f MiB\n", double(peak) / 1024.0);
    bool met = gErrors == 0 && percentile(0.99) < 20.0 && peak < 256 * 1024;
    return met ? 0 : 1;
}

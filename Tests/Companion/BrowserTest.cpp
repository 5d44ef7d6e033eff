#include "Settle/Web/Browser.h"

#include "Settle/Web/EndSignals.h"
#include "Support/Surroundings.h"

#include <csignal>
#include <gtest/gtest.h>
#include <poll.h>
#include <unistd.h>

namespace {

using namespace ovrin;
using surroundings::Variable;

const std::string kAddress = "http://127.0.0.1:8123/0a/";

/// What is told of a browser until it has ended.
std::string ProblemOf(Browser& browser) {
    for (;;) {
        if (const std::optional<std::string> problem = browser.Problem()) return *problem;
        if (!browser.IsPending()) return "none";
        usleep(1000);
    }
}

struct BrowserTest : testing::Test {
    BrowserTest() {
        programs.Say("my-browser", "", "what it says is nobody's");
        programs.Say("xdg-open", "", "");
        programs.Say("broken", "", "", 3);
    }
    /// What is told for this value of BROWSER, and what was called: "none; my-browser ADDRESS".
    std::string Opened(const std::optional<std::string>& value) {
        const Variable set("BROWSER", value);
        std::filesystem::remove(programs.Folder() / "calls");
        Browser browser(kAddress);
        const std::string problem = ProblemOf(browser);
        EXPECT_FALSE(browser.Problem()) << "told twice: " << problem;
        const std::string calls = programs.Calls();
        return problem + "; " + (calls == "<missing>" ? "" : calls.substr(0, calls.find('\n')));
    }

    surroundings::FakePrograms programs;
    const Variable display{"DISPLAY", {}}, wayland{"WAYLAND_DISPLAY", {}};
};

TEST_F(BrowserTest, AddressStandsWhereItIsWanted) {
    EXPECT_EQ(Opened("my-browser"), "none; my-browser " + kAddress);
    EXPECT_EQ(Opened("  my-browser   --new  "), "none; my-browser --new " + kAddress);
    EXPECT_EQ(Opened("my-browser %s --new"), "none; my-browser " + kAddress + " --new");
    EXPECT_EQ(Opened("my-browser --app=%s&"), "none; my-browser --app=" + kAddress + "&");
}

TEST_F(BrowserTest, NextOneIsTriedWhereOneIsNotThere) {
    EXPECT_EQ(Opened("no-such-program %s:my-browser:broken"), "none; my-browser " + kAddress);
    EXPECT_EQ(Opened(": ::my-browser"), "none; my-browser " + kAddress);
    EXPECT_EQ(Opened("broken:my-browser"), "The browser couldn't be opened; broken " + kAddress);
    EXPECT_EQ(Opened("my-browser;true"), "Cannot start my-browser;true: No such file or directory; ");
    EXPECT_EQ(Opened("%s"), "Cannot start http://127.0.0.1:8123/0a/: No such file or directory; ");
}

TEST_F(BrowserTest, DesktopIsAskedWhereNoBrowserIsNamed) {
    const std::string none = "There is no desktop here, and BROWSER names no browser; ";
    for (const char* empty : {"", " ", ": :"}) EXPECT_EQ(Opened(empty), none) << empty;
    EXPECT_EQ(Opened({}), none);
    for (const char* name : {"DISPLAY", "WAYLAND_DISPLAY"}) {
        const Variable desktop(name, ":0");
        EXPECT_EQ(Opened({}), "none; xdg-open " + kAddress);
        EXPECT_EQ(Opened("my-browser"), "none; my-browser " + kAddress);
    }
}

bool IsReadable(int file) {
    pollfd state{file, POLLIN, 0};
    return poll(&state, 1, 0) > 0;
}

TEST(EndSignalsTest, FirstSignalIsHeardOf) {
    for (const int number : {SIGINT, SIGTERM, SIGHUP}) {
        const auto before = std::signal(number, SIG_DFL);
        {
            const EndSignals signals;
            EXPECT_FALSE(IsReadable(signals.File()));
            raise(number);
            EXPECT_TRUE(IsReadable(signals.File()));
        }
        EXPECT_EQ(std::signal(number, before), SIG_DFL);
    }
}

TEST(EndSignalsTest, IgnoredSignalStaysIgnored) {
    const auto before = std::signal(SIGHUP, SIG_IGN);
    {
        const EndSignals signals;
        raise(SIGHUP);
        EXPECT_FALSE(IsReadable(signals.File()));
    }
    std::signal(SIGHUP, before);
}

TEST(EndSignalsDeathTest, SecondSignalEndsTheProgram) {
    const auto interruptTwice = [] {
        const EndSignals signals;
        raise(SIGINT);
        if (IsReadable(signals.File())) raise(SIGINT);
    };
    EXPECT_EXIT(interruptTwice(), testing::KilledBySignal(SIGINT), "");
}

} // namespace

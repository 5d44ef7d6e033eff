// Wide characters, for glibc and for curses.
#define _XOPEN_SOURCE_EXTENDED 1 // NOLINT(bugprone-reserved-identifier)
#define NCURSES_NOMACROS 1
#include "Settle/Terminal/Curses.h"

#include "Descriptor.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <curses.h>
#include <string>
#include <term.h>
#include <termios.h>
#include <unistd.h>

namespace ovrin {

namespace {

constexpr int kSignals[] = {SIGINT, SIGTERM, SIGHUP, SIGQUIT};
constexpr int kEscapeDelay = 100; // milliseconds that the rest of an arrow key or a character may take
constexpr std::uint32_t kLastCharacter = 0x10FFFF, kNoCharacter = 0xFFFFFFFF;

// What the handler of signals needs, which may call next to nothing.
pid_t s_Owner;
termios s_Before;
std::string s_Leaving; // never changed while signals are handled
std::array<struct sigaction, std::size(kSignals)> s_Actions;

void LeaveBySignal(int signal) {
    // A copy of this process that merges a scene leaves the terminal to this one.
    if (getpid() == s_Owner) {
        std::signal(SIGTTOU, SIG_IGN); // it may run in the background
        WriteFully(STDOUT_FILENO, s_Leaving.data(), s_Leaving.size());
        tcsetattr(STDIN_FILENO, TCSANOW, &s_Before);
    }
    std::signal(signal, SIG_DFL);
    raise(signal); // delivered when this handler returns
}

int CollectLeaving(int byte) {
    s_Leaving += static_cast<char>(byte);
    return byte;
}

void HandleSignals(const char* words) {
    s_Owner = getpid();
    s_Leaving.clear();
    for (const char* name : {"sgr0", "rmkx", "cnorm", "rmcup"}) {
        char capability[8];
        std::strcpy(capability, name);
        const char* const text = tigetstr(capability);
        if (text && text != reinterpret_cast<const char*>(-1)) tputs(text, 1, CollectLeaving);
    }
    s_Leaving += words;
    for (std::size_t at = 0; at < s_Actions.size(); ++at) {
        sigaction(kSignals[at], nullptr, &s_Actions[at]);
        if (s_Actions[at].sa_handler == SIG_IGN) continue; // as nohup has it
        struct sigaction action {};
        action.sa_handler = LeaveBySignal;
        sigfillset(&action.sa_mask);
        sigaction(kSignals[at], &action, nullptr);
    }
}

void RestoreSignals() {
    for (std::size_t at = 0; at < s_Actions.size(); ++at)
        if (s_Actions[at].sa_handler != SIG_IGN) std::signal(kSignals[at], SIG_DFL);
}

struct Look {
    int attributes;
    short colour; ///< -1 for the terminal's own
};

/// In the order of Style. What it says must be seen without colours, too.
constexpr std::array<Look, 11> kLooks = {{
    {0, -1},                    // Plain
    {A_DIM, -1},                // Faint
    {A_BOLD, -1},               // Strong
    {A_REVERSE, -1},            // Bar
    {A_REVERSE | A_BOLD, -1},   // Selected
    {A_BOLD, COLOR_CYAN},       // Key
    {A_BOLD, COLOR_BLUE},       // Base
    {A_BOLD, COLOR_GREEN},      // Ours
    {A_BOLD, COLOR_MAGENTA},    // Theirs
    {A_BOLD | A_UNDERLINE, -1}, // Difference
    {A_BOLD, COLOR_RED},        // Warning
}};

bool WantsColours() {
    const char* const no = std::getenv("NO_COLOR");
    return !(no && *no) && has_colors();
}

attr_t AttributesOf(Style style, bool hasColours) {
    const auto at = static_cast<std::size_t>(style);
    const attr_t pair = hasColours && kLooks[at].colour >= 0 ? COLOR_PAIR(static_cast<int>(at) + 1) : 0;
    return static_cast<attr_t>(kLooks[at].attributes) | pair;
}

void MakeColours() {
    start_color();
    use_default_colors();
    for (std::size_t at = 0; at < kLooks.size(); ++at)
        if (kLooks[at].colour >= 0) init_pair(static_cast<short>(at + 1), kLooks[at].colour, -1);
}

Key FunctionKey(int code) {
    switch (code) {
    case KEY_UP:
        return Key::Up;
    case KEY_DOWN:
        return Key::Down;
    case KEY_LEFT:
        return Key::Left;
    case KEY_RIGHT:
        return Key::Right;
    case KEY_PPAGE:
        return Key::PageUp;
    case KEY_NPAGE:
        return Key::PageDown;
    case KEY_HOME:
        return Key::Home;
    case KEY_END:
        return Key::End;
    case KEY_ENTER:
        return Key::Enter;
    case KEY_BTAB:
        return Key::BackTab;
    case KEY_BACKSPACE:
        return Key::Erase;
    case KEY_RESIZE:
        return Key::Redraw;
    default:
        return Key::Unknown;
    }
}

Key CharacterKey(std::uint32_t code) {
    switch (code) {
    case '\r':
    case '\n':
        return Key::Enter;
    case '\t':
        return Key::Tab;
    case 0x1B:
        return Key::Escape;
    case 0x08:
    case 0x7F:
        return Key::Erase;
    case 0x0C: // Ctrl-L
        clearok(curscr, TRUE);
        return Key::Redraw;
    default:
        return code < 0x20 || code > kLastCharacter ? Key::Unknown : static_cast<Key>(code);
    }
}

/// The character of UTF-8 that begins with a byte, whose other bytes come at once. Curses itself would wait
/// for more of what is no character in the locale, and swallow the keys that follow.
Key LongCharacterKey(int first) {
    if (first < 0xC2 || first > 0xF4) return Key::Unknown;
    const int bytes = first >= 0xF0 ? 4 : first >= 0xE0 ? 3 : 2;
    auto code = static_cast<std::uint32_t>(first & (0x7F >> bytes));
    timeout(kEscapeDelay);
    for (int at = 1; at < bytes && code != kNoCharacter; ++at) {
        const int next = getch();
        const bool isOfIt = next != ERR && (next & ~0x3F) == 0x80;
        if (!isOfIt && next != ERR) ungetch(next);
        code = isOfIt ? (code << 6) | static_cast<std::uint32_t>(next & 0x3F) : kNoCharacter;
    }
    timeout(-1);
    return code < 0x80 ? Key::Unknown : CharacterKey(code);
}

} // namespace

std::unique_ptr<Curses> Curses::Open(const char* words) {
    const char* const terminal = std::getenv("TERM");
    int found = 0;
    if (!terminal || !*terminal || setupterm(nullptr, STDOUT_FILENO, &found) == ERR) return nullptr;
    char address[] = "cup";
    const char* const canAddress = tigetstr(address);
    if (!canAddress || canAddress == reinterpret_cast<const char*>(-1)) return nullptr;
    if (tcgetattr(STDIN_FILENO, &s_Before) != 0 || !newterm(nullptr, stdout, stdin)) return nullptr;
    HandleSignals(words);
    return std::unique_ptr<Curses>(new Curses);
}

Curses::Curses() {
    set_escdelay(kEscapeDelay);
    cbreak();
    noecho();
    nonl();
    keypad(stdscr, TRUE);
    curs_set(0);
    if (WantsColours()) MakeColours();
}

Curses::~Curses() {
    endwin();
    RestoreSignals();
}

Extent Curses::Size() const {
    return {static_cast<std::size_t>(std::max(getmaxx(stdscr), 1)),
            static_cast<std::size_t>(std::max(getmaxy(stdscr), 1))};
}

void Curses::Show(const std::vector<StyledLine>& picture) {
    const bool hasColours = WantsColours();
    erase();
    for (std::size_t at = 0; at < picture.size(); ++at) {
        move(static_cast<int>(at), 0);
        for (const StyledSpan& span : picture[at]) {
            attrset(static_cast<int>(AttributesOf(span.style, hasColours)));
            addnstr(span.text.data(), static_cast<int>(span.text.size()));
        }
    }
    attrset(0);
    refresh();
}

std::optional<Key> Curses::Read() {
    errno = 0;
    const int code = getch();
    if (code == ERR) return errno == EINTR ? std::optional(Key::Redraw) : std::nullopt;
    if (code > 0xFF) return FunctionKey(code);
    return code < 0x80 ? CharacterKey(static_cast<std::uint32_t>(code)) : LongCharacterKey(code);
}

} // namespace ovrin

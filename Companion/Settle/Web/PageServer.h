#pragma once

#include "Review/PageRequest.h"

#include <functional>

namespace ovrin {

struct PageOptions {
    int port = 0; ///< 0 for any that is free
    bool opensBrowser = true;
};

/// Why nothing is served any more.
enum class PageEnd {
    Over,   ///< an answer said so
    Closed, ///< the last page was closed, and none was opened again within some seconds
    Stopped ///< a signal asked for it, as Ctrl-C does
};

/// Serves a page to the browsers of this user, on this machine alone: starts the program "ovrin-web", which
/// stands beside this one, tells the page's address on standard error, opens the desktop's browser if it is
/// to, and answers one request after the other until the end.
///
/// What `answer` throws as Failure becomes an answer of status 400 with its words. Throws Failure where
/// ovrin-web isn't installed or comes to an end by itself, and for a port that can't be had. Copies of this
/// process and programs that are started meanwhile hold nothing of it open.
PageEnd ServePages(const PageOptions& options, const std::function<PageAnswer(const PageRequest&)>& answer);

} // namespace ovrin

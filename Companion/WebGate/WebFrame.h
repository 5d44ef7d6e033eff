#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace ovrin {

/// What the model and the program that serves its pages send each other: texts of any bytes.
///
///     model  {"serve", token, port}              once; port 0 for any
///     gate   {"serving", port} or {"failed", words}   once
///     gate   {"pages", count}                    whenever a page was opened or closed
///     gate   {"request", method, path, body, name, value, name, value...}   with the query
///     model  {"answer", status, type, body, "over" or ""}   to each request, before there is another
///
/// Either side ends when the other one closes.
using WebFrame = std::vector<std::string>;

/// Bytes that a frame from the gate may have, and one from the model.
constexpr std::size_t kMostRequestFrame = std::size_t{512} * 1024;
constexpr std::size_t kMostAnswerFrame = std::size_t{256} * 1024 * 1024;

/// Sends a frame, waiting as long as it takes. False if there is nobody to read it.
bool SendFrame(int socket, const WebFrame& frame);

/// Waits for a frame. Nothing at the end, and for what is no frame of at most `most` bytes.
std::optional<WebFrame> ReceiveFrame(int socket, std::size_t most);

} // namespace ovrin

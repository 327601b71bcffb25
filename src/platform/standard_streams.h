// The standard streams of the process. Texts are UTF-8, and reach a file or a pipe byte by byte as they are.
#pragma once

#include <string>
#include <string_view>
#include <system_error>

namespace tendril {

enum class Stream { kInput, kOutput, kError };

// Call it before anything is read or written: a write that cannot succeed fails, where the system would end the program
// instead, and input is read byte by byte as it is.
void PrepareStreams();

// Whether it is a terminal's.
bool IsTerminal(Stream stream);

// The columns of its terminal; 0 when it is none's.
int TerminalColumns(Stream stream);

// Whether it is a terminal that understands colours.
bool TerminalHasColours(Stream stream);

// Writes all of `text` at once. Returns why not all of it was written. A request to end the program interrupts the wait
// for a reader that stands still: std::errc::interrupted. What is left is not kept then.
std::error_code WriteAll(Stream stream, std::string_view text);

// What the system says about `fault`, as the end of a sentence: without a full stop.
std::string ReasonText(const std::error_code& fault);

// What was typed before a question does not answer it.
void DropTypedInput();

}  // namespace tendril

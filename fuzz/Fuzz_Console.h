#pragma once

#include <string>
#include <vector>

// Stands in for the system shell when the program runs one of the console's
// listing tools, so the listings can be fuzzed without starting a process.
// Linking Fuzz_Console.cpp replaces the C library's system(): a command line
// that starts with a listing tool gets the prepared output written into its
// standard-output file and exits with 0; any other command line (the fuzzer's
// own) goes to the real shell.
namespace Fuzz_Console {

// What the next listing tool prints on standard output, byte for byte.
void u_set_Output(std::string const& output);

// The listing command lines run so far, without their redirections.
std::vector<std::string> const& u_get_Commands();
void u_clear_Commands();

} // namespace Fuzz_Console

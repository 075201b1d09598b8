#include "survey/SurveyTest_Utility.h"

#include "utility/Trace.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <iostream>
#include <map>
#include <regex>
#include <sstream>
#include <sys/wait.h>
#include <unistd.h>

namespace SurveyTest_Utility {

namespace {

constexpr char gc_SampleTimeStamp[] = "1700000000000";

// An unnamed file that the child writes one standard stream into.
class CaptureFile {
public:
    CaptureFile() : _file(std::tmpfile()) {}
    ~CaptureFile() {
        if (_file != nullptr) {
            std::fclose(_file);
        }
    }
    CaptureFile(CaptureFile const&) = delete;
    CaptureFile& operator=(CaptureFile const&) = delete;

    void redirect(int descriptor) const {
        if (_file == nullptr || ::dup2(::fileno(_file), descriptor) < 0) {
            ::_exit(126);
        }
    }

    std::string text() const {
        std::string content;
        if (_file == nullptr) {
            return content;
        }
        std::rewind(_file);
        char buffer[4096];
        std::size_t read = 0;
        while ((read = std::fread(buffer, 1, sizeof buffer, _file)) > 0) {
            content.append(buffer, read);
        }
        return content;
    }

private:
    std::FILE* _file;
};

int u_wait_For(pid_t child) {
    int status = 0;
    while (::waitpid(child, &status, 0) < 0) {
        if (errno != EINTR) {
            return -1;
        }
    }
    if (WIFEXITED(status)) {
        return WEXITSTATUS(status);
    }
    return WIFSIGNALED(status) ? 128 + WTERMSIG(status) : -1;
}

std::string u_get_GeneratedName(std::size_t index) {
    if (index < 26) {
        return std::string(6, static_cast<char>('a' + index));
    }
    std::ostringstream name;
    name << "n" << index;
    return name.str();
}

// text with every match of pattern replaced by what replacement makes of it.
std::string u_replace_Matches(std::string const& text, std::regex const& pattern,
                              std::function<std::string(std::smatch const&)> const& replacement) {
    std::string replaced;
    auto rest = text.cbegin();
    for (std::sregex_iterator match(text.cbegin(), text.cend(), pattern), end; match != end;
         ++match) {
        replaced.append(rest, (*match)[0].first);
        replaced += replacement(*match);
        rest = (*match)[0].second;
    }
    replaced.append(rest, text.cend());
    return replaced;
}

} // namespace

ChildOutput u_run_InChild(std::function<int()> const& work) {
    CaptureFile const out;
    CaptureFile const err;
    std::cout.flush();
    std::cerr.flush();
    pid_t const child = ::fork();
    if (child < 0) {
        return {};
    }
    if (child == 0) {
        out.redirect(STDOUT_FILENO);
        err.redirect(STDERR_FILENO);
        int const result = work();
        std::cout.flush();
        std::cerr.flush();
        ::_exit(result);
    }
    ChildOutput output;
    output.exitStatus = u_wait_For(child);
    output.stdoutText = out.text();
    output.stderrText = err.text();
    return output;
}

ChildOutput u_run_InChild_Traced(std::string const& tracePath, std::function<int()> const& work) {
    return u_run_InChild([&tracePath, &work]() {
        Utility::Trace trace(tracePath);
        int const result = work();
        trace.flush();
        return result;
    });
}

std::string u_normalise_TemporaryNames(std::string const& text) {
    static std::regex const temporaryName("/tmp/ShellCommand\\.([A-Za-z0-9]{6})");
    std::map<std::string, std::string> generated;
    return u_replace_Matches(text, temporaryName, [&generated](std::smatch const& match) {
        auto const placed =
            generated.emplace(match[1].str(), u_get_GeneratedName(generated.size()));
        return "/tmp/ShellCommand." + placed.first->second;
    });
}

std::string u_normalise_TimeStamps(std::string const& text, long first, long last) {
    static std::regex const timeStamp("timestamp=\"([0-9]{10})000\"");
    return u_replace_Matches(text, timeStamp, [first, last](std::smatch const& match) {
        long const seconds = std::stol(match[1].str());
        bool const inRun = seconds >= first && seconds <= last;
        return inRun ? std::string("timestamp=\"") + gc_SampleTimeStamp + "\"" : match[0].str();
    });
}

std::vector<std::string> u_list_Folder(std::string const& folder) {
    std::vector<std::string> names;
    std::error_code error;
    for (std::filesystem::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        names.push_back(entry->path().filename().string());
    }
    std::sort(names.begin(), names.end());
    return names;
}

void u_clear_Folder(std::string const& folder) {
    for (std::string const& name : u_list_Folder(folder)) {
        std::error_code ignored;
        std::filesystem::remove_all(std::filesystem::path(folder) / name, ignored);
    }
}

} // namespace SurveyTest_Utility

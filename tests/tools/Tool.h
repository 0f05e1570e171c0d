#pragma once

#include "harness/Places.h"

#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <fstream>
#include <initializer_list>
#include <iterator>
#include <stdexcept>
#include <string>
#include <string_view>
#include <sys/wait.h>
#include <unistd.h>
#include <utility>
#include <vector>

namespace kestrum::tools {

inline std::string contentsOf(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    if (!file)
        throw std::runtime_error(path + " cannot be read");
    return {std::istreambuf_iterator<char>(file), {}};
}

inline void writeFile(const std::string& path, std::string_view contents, std::ios::openmode mode = std::ios::trunc)
{
    std::ofstream file(path, std::ios::binary | mode);
    file << contents;
    if (!file.flush())
        throw std::runtime_error(path + " cannot be written");
}

/// kestrum-decode as a process, with pipes for its standard streams.
class Tool {
public:
    explicit Tool(std::vector<std::string> arguments)
    {
        int in[2], out[2], error[2];
        if (::pipe2(in, O_CLOEXEC) != 0 || ::pipe2(out, O_CLOEXEC) != 0 || ::pipe2(error, O_CLOEXEC) != 0)
            throw std::runtime_error("no pipes");
        arguments.insert(arguments.begin(), builtProgram("kestrum-decode"));
        std::vector<char*> list;
        for (auto& each : arguments)
            list.push_back(each.data());
        list.push_back(nullptr);
        _process = ::fork();
        if (_process == 0) {
            ::dup2(in[0], 0);
            ::dup2(out[1], 1);
            ::dup2(error[1], 2);
            ::execv(list[0], list.data());
            ::_exit(127);
        }
        ::close(in[0]);
        ::close(out[1]);
        ::close(error[1]);
        _in = in[1];
        _out = out[0];
        _error = error[0];
    }
    ~Tool()
    {
        closeInput();
        closeOutput();
        ::close(_error);
        if (_process > 0) {
            ::kill(_process, SIGKILL);
            ::waitpid(_process, nullptr, 0);
        }
    }
    Tool(const Tool&) = delete;
    Tool& operator=(const Tool&) = delete;

    /// False when the tool has closed its input.
    bool write(std::string_view text)
    {
        while (!text.empty()) {
            const auto written = ::write(_in, text.data(), text.size());
            if (written <= 0)
                return false;
            text.remove_prefix(static_cast<std::size_t>(written));
        }
        return true;
    }
    void closeInput() { closeOnce(_in); }
    void closeOutput() { closeOnce(_out); }
    void signal(int number) const { ::kill(_process, number); }
    ::pid_t process() const { return _process; }

    /// Waits for the next line, and returns it without its line end.
    std::string line() { return lineOf(_out); }
    /// The same for standard error.
    std::string remark() { return lineOf(_error); }
    std::string output() { return rest(_out); }
    std::string remarks() { return rest(_error); }
    /// The exit status; 128 plus the signal's number when a signal ended it.
    int status()
    {
        int status = 0;
        ::waitpid(std::exchange(_process, -1), &status, 0);
        return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    }

private:
    static void closeOnce(int& end)
    {
        if (end >= 0)
            ::close(std::exchange(end, -1));
    }
    static std::string lineOf(int from)
    {
        std::string text;
        for (char next; ::read(from, &next, 1) == 1 && next != '\n';)
            text += next;
        return text;
    }
    static std::string rest(int from)
    {
        std::string text;
        char piece[1 << 16];
        for (::ssize_t got; (got = ::read(from, piece, sizeof piece)) > 0;)
            text.append(piece, static_cast<std::size_t>(got));
        return text;
    }

    ::pid_t _process;
    int _in, _out, _error;
};

struct Ran {
    int status;
    std::string output, remarks;
};

/// Runs it to its end. Its remarks must fit into a pipe's buffer.
inline Ran run(std::vector<std::string> arguments, std::string_view input = {})
{
    Tool tool(std::move(arguments));
    tool.write(input);
    tool.closeInput();
    auto output = tool.output();
    auto remarks = tool.remarks();
    return {tool.status(), std::move(output), std::move(remarks)};
}

} // namespace kestrum::tools

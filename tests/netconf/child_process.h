// A program a test starts, found on the PATH: the test writes its input, and its output and
// errors are read to the end as they come, so it never blocks on a full pipe.
#pragma once

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

extern char** environ;

class ChildProcess {
public:
    explicit ChildProcess(std::vector<std::string> args) {
        int in[2], out[2];
        if (pipe2(in, O_CLOEXEC) != 0 || pipe2(out, O_CLOEXEC) != 0) return;
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_adddup2(&actions, in[0], STDIN_FILENO);
        posix_spawn_file_actions_adddup2(&actions, out[1], STDOUT_FILENO);
        posix_spawn_file_actions_adddup2(&actions, out[1], STDERR_FILENO);
        std::vector<char*> argv;
        for (std::string& arg : args)
            argv.push_back(arg.data());
        argv.push_back(nullptr);
        if (posix_spawnp(&m_pid, argv[0], &actions, nullptr, argv.data(), environ) != 0) m_pid = -1;
        posix_spawn_file_actions_destroy(&actions);
        close(in[0]);
        close(out[1]);
        m_input = in[1];
        m_reader = std::thread([this, readFd = out[0]] {
            char buffer[4096];
            for (ssize_t got; (got = read(readFd, buffer, sizeof buffer)) > 0;) {
                const std::lock_guard<std::mutex> lock(m_mutex);
                m_output.append(buffer, static_cast<std::size_t>(got));
                m_changed.notify_all();
            }
            close(readFd);
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_ended = true;
            m_changed.notify_all();
        });
    }
    // Kills the program if it still runs.
    ~ChildProcess() {
        Wait(SIGKILL);
        if (m_input >= 0) close(m_input);
    }

    // Whether the output shows text within seconds; false once the program ended without it.
    bool WaitFor(const std::string& text, double seconds) {
        std::unique_lock<std::mutex> lock(m_mutex);
        m_changed.wait_for(lock, std::chrono::duration<double>(seconds),
                           [&] { return m_ended || m_output.find(text) != std::string::npos; });
        return m_output.find(text) != std::string::npos;
    }
    void Say(const std::string& text) {
        // A program that died meanwhile shows in its exit status.
        const ssize_t written = write(m_input, text.data(), text.size());
        static_cast<void>(written);
    }
    // Sends signal (0: none), then waits for the end: the exit status, -1 when a signal ended it.
    int Wait(int signal = 0) {
        if (m_pid > 0) {
            if (signal != 0) kill(m_pid, signal);
            waitpid(m_pid, &m_status, 0);
            m_pid = -1;
        }
        if (m_reader.joinable()) m_reader.join();
        return WIFEXITED(m_status) ? WEXITSTATUS(m_status) : -1;
    }
    std::string Output() const {
        const std::lock_guard<std::mutex> lock(m_mutex);
        return m_output;
    }

private:
    pid_t m_pid = -1;
    int m_input = -1;
    int m_status = -1;
    std::thread m_reader;
    mutable std::mutex m_mutex;
    std::condition_variable m_changed;
    std::string m_output;
    bool m_ended = false;
};

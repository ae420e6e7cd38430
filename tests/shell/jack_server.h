#pragma once
// A JACK server with its dummy driver, started for a test and stopped by its process id:
// real MIDI ports between threads of one test, on a machine with no sound hardware.
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <string>

extern char** environ;

namespace ondrel::test {

class JackServer {
public:
    // Starts the server and points RtMidi and libjack at it; running() says whether it came up.
    JackServer() : name_("ondrel-test-" + std::to_string(getpid())) {
        if (access("/usr/bin/jackd", X_OK) != 0) return;
        setenv("JACK_NO_AUDIO_RESERVATION", "1", 1);
        const char* argv[] = {"jackd", "-n", name_.c_str(), "-d", "dummy", "-r", "44100", "-p", "512", nullptr};
        posix_spawn_file_actions_t quiet;
        posix_spawn_file_actions_init(&quiet);
        posix_spawn_file_actions_addopen(&quiet, 1, "/dev/null", 0x1 /* O_WRONLY */, 0);
        posix_spawn_file_actions_addopen(&quiet, 2, "/dev/null", 0x1, 0);
        if (posix_spawn(&pid_, "/usr/bin/jackd", &quiet, nullptr, const_cast<char**>(argv), environ) != 0) pid_ = 0;
        posix_spawn_file_actions_destroy(&quiet);
        if (!pid_) return;
        setenv("JACK_DEFAULT_SERVER", name_.c_str(), 1);
        setenv("ONDREL_MIDI_API", "jack", 1);
        const std::string wait = "jack_wait -s " + name_ + " -w -t 10 >/dev/null 2>&1";
        running_ = std::system(wait.c_str()) == 0;
    }
    ~JackServer() {
        unsetenv("ONDREL_MIDI_API");
        unsetenv("JACK_DEFAULT_SERVER");
        if (!pid_) return;
        kill(pid_, SIGTERM);
        int status = 0;
        waitpid(pid_, &status, 0);
    }
    JackServer(const JackServer&) = delete;
    JackServer& operator=(const JackServer&) = delete;

    bool running() const { return running_; }

private:
    std::string name_;
    pid_t pid_ = 0;
    bool running_ = false;
};

}  // namespace ondrel::test

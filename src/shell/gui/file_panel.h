#pragma once
#include <string>
#include <vector>

namespace ondrel {

class Program;

// The program's own file panel: the directories and files of one directory, the known
// file types first, and a typed name. Drawn while the program asks for a file.
class FilePanel {
public:
    void draw(Program& p);

private:
    struct Entry {
        std::string name;
        bool directory = false;
        int kind = 0;  // module, sound or other file, as opening would sort it
    };
    void list(const std::string& directory);
    void choose(Program& p, const std::string& name);

    bool was_open_ = false;
    std::string directory_;
    std::vector<Entry> entries_;
    char directory_text_[1024] = {};
    char name_[512] = {};
    std::string error_;
    std::string confirm_replace_;  // a file that exists, waiting for "Replace"
};

}  // namespace ondrel

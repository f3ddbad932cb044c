// The names of this process's threads as the kernel keeps them (15 characters at most), for
// tests that check which threads run and that they are gone.
#pragma once

#include <algorithm>
#include <dirent.h>
#include <fstream>
#include <string>
#include <vector>

inline std::vector<std::string> ThreadNames()
{
    std::vector<std::string> names;
    DIR* tasks = opendir("/proc/self/task");
    if (!tasks)
        return names;
    while (dirent* entry = readdir(tasks)) {
        if (entry->d_name[0] == '.')
            continue;
        std::ifstream comm(std::string("/proc/self/task/") + entry->d_name + "/comm");
        std::string name;
        std::getline(comm, name);
        names.push_back(name);
    }
    closedir(tasks);
    return names;
}

inline int Count(const std::vector<std::string>& names, const std::string& name)
{
    return int(std::count(names.begin(), names.end(), name));
}

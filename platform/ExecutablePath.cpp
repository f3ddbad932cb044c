// The executable's directory, from the kernel's link to the running image.
#include "platform/ExecutablePath.h"

#include <system_error>

std::filesystem::path ExecutableDirectory()
{
    std::error_code error;
    const std::filesystem::path self = std::filesystem::read_symlink("/proc/self/exe", error);
    if (error)
        return {};
    return self.parent_path();
}

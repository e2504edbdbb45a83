#include <fcntl.h>
#include <unistd.h>

// Leaves a block behind where /dev/null can't be opened, and nothing otherwise.

int main()
{
    const char* volatile block = new char[100];
    const int file = open("/dev/null", O_RDONLY);
    if (file >= 0)
        delete[] block;
    block = nullptr;
    if (file >= 0)
        close(file);
    return 0;
}

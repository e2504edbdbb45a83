// Writes a tone, a cover and an export description with every element into a folder.

#include "tools/samples/cover.h"
#include "tools/samples/description.h"
#include "tools/samples/tone.h"

#include <cstdio>
#include <filesystem>

int main(int argc, char** argv)
{
    if (argc != 2)
    {
        std::fprintf(stderr, "usage: make-samples FOLDER\n");
        return 2;
    }

    const std::filesystem::path folder = std::filesystem::absolute(argv[1]).lexically_normal();
    std::error_code error;
    std::filesystem::create_directories(folder, error);
    const std::string audio = folder / "evening walk.wav";
    const std::string cover = folder / "cover.png";

    SampleDescription description;
    description.language("us").configuration({{"RequireLogin", "false"}, {"GuiMode", "false"}});
    description.track(everyElement(audio, cover), {"rock", "deep house"});
    if (!writeTone(audio, 1.0) || !writeCover(cover, 64) || !description.write(folder / "description.xml"))
    {
        std::fprintf(stderr, "make-samples: cannot write to %s\n", folder.c_str());
        return 1;
    }
    return 0;
}

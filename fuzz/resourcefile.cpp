// A resource file that anybody may have made: opened, listed, checked, and each file of it read.

#include "foundation/object/iptr.h"
#include "services/components/fcomponentregistry.h"
#include "storage/resource/ffilearchiveiterator.h"
#include "storage/resource/fresourcearchive.h"
#include "storage/resource/resourcecheck.h"
#include "storage/stream/fmemorystream.h"

#include <cstdint>
#include <cstdlib>

namespace
{
/// Deflated files hold at most about a thousand times their bytes; more of them isn't worth the time.
constexpr int64 kMaxContent = 1 << 24;

void require(bool holds)
{
    if (!holds)
        abort();
}

void lookUpAll(FResourceArchive& archive)
{
    FFileArchiveIterator walk(&archive, archive.getRoot(), true);
    int64 count = 0;
    for (; !walk.done(); walk.next(), count++)
    {
        const FFileArchiveNode* node = walk.currentNode();
        require(node->isFolder() || node->getDataSize() == 0 ||
                node->getDataOffset() + node->getDataSize() <= archive.getContentEnd());
        FPath path;
        node->getPath(path);
        (void)archive.lookupNode(&path);
    }
    require(archive.getRoot()->countFiles(true, true, nullptr) == count);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FComponentRegistry::bringUp();
    FMemoryStream bytes(const_cast<uint8_t*>(data), static_cast<int64>(size));
    const IPtr<FResourceArchive> archive = adopt(new FResourceArchive(&bytes, 0));
    if (!archive->open())
    {
        require(!archive->isOpen() && !archive->getRoot());
        return 0;
    }
    lookUpAll(*archive);
    uint64 content = 0;
    archive->getRoot()->countFiles(true, false, &content);
    if (content <= kMaxContent)
        ResourceCheck(*archive).run();
    require(archive->close());
    return 0;
}

#include "tools/service/bodyreader.h"

#include <chrono>
#include <cstdio>
#include <thread>

namespace
{

/// A text field longer than this is cut: a file must never end up here by mistake.
constexpr std::size_t kMaximumText = 16 << 20;

bool isFilePart(const httplib::MultipartFormData& part)
{
    return !part.filename.empty() || !part.content_type.empty();
}

std::string hexadecimal(const unsigned char* bytes, unsigned count)
{
    std::string result;
    for (unsigned i = 0; i < count; ++i)
    {
        char digits[3];
        std::snprintf(digits, sizeof digits, "%02x", bytes[i]);
        result += digits;
    }
    return result;
}

} // namespace

BodyReader::BodyReader(const Behaviour& planned, std::function<void()> onStall,
                       std::function<void(bool)> onDisconnect)
    : behaviour(planned),
      stall(std::move(onStall)),
      disconnect(std::move(onDisconnect))
{
}

bool BodyReader::read(const httplib::ContentReader& reader)
{
    const bool whole = reader([this](const httplib::MultipartFormData& part) { return beginField(part); },
                              [this](const char* bytes, std::size_t size) { return addBytes(bytes, size); });
    finishField();
    // A body that ended before the planned place misbehaves at its end.
    return whole && (misbehaved || misbehave());
}

std::vector<ReceivedField> BodyReader::takeFields()
{
    return std::move(fields);
}

bool BodyReader::beginField(const httplib::MultipartFormData& part)
{
    finishField();
    ReceivedField field;
    field.name = part.name;
    field.isFile = isFilePart(part);
    field.fileName = part.filename;
    field.contentType = part.content_type;
    fields.push_back(std::move(field));
    return EVP_DigestInit_ex(digest.get(), EVP_sha256(), nullptr) == 1;
}

bool BodyReader::addBytes(const char* bytes, std::size_t size)
{
    ReceivedField& field = fields.back();
    field.size += size;
    if (field.isFile)
        EVP_DigestUpdate(digest.get(), bytes, size);
    else if (field.text.size() + size <= kMaximumText)
        field.text.append(bytes, size);

    total += static_cast<std::int64_t>(size);
    if (behaviour.kind == Behaviour::Kind::slow)
        std::this_thread::sleep_for(std::chrono::milliseconds(behaviour.number));
    return misbehaved || total < behaviour.number || misbehave();
}

void BodyReader::finishField()
{
    if (fields.empty() || !fields.back().isFile || !fields.back().sha256.empty())
        return;

    unsigned char bytes[EVP_MAX_MD_SIZE];
    unsigned count = 0;
    EVP_DigestFinal_ex(digest.get(), bytes, &count);
    fields.back().sha256 = hexadecimal(bytes, count);
}

/// False if the connection is gone now.
bool BodyReader::misbehave()
{
    misbehaved = true;
    switch (behaviour.kind)
    {
    case Behaviour::Kind::stall:
        stall();
        return true;
    case Behaviour::Kind::close:
    case Behaviour::Kind::reset:
        disconnect(behaviour.kind == Behaviour::Kind::reset);
        return false;
    default:
        return true;
    }
}

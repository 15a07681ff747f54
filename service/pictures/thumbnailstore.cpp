#include "pictures/thumbnailstore.h"

#include "pictures/picturefolder.h"
#include "pictures/picturemaker.h"

#include <algorithm>
#include <future>
#include <map>

namespace {

constexpr int largestWidth = 8192;

// Part of each picture's name: raise it when pictures are made differently.
constexpr const char *makingVersion = "1";

std::string keyOf(const std::string &identity, int width)
{
    return std::string(makingVersion) + ' ' + std::to_string(width) + ' ' + identity;
}

} // namespace

class ThumbnailStore::Private
{
public:
    Private(std::string folder, std::int64_t maximumBytes)
        : mFolder(std::move(folder), maximumBytes)
    {
    }

    Result picture(const std::string &sourcePath, const std::string &key, int width);

private:
    using Answer = std::shared_ptr<const Result>;

    Answer findOrMake(const std::string &sourcePath, const std::string &key, int width);
    Result make(const std::string &sourcePath, const std::string &key, int width);

    // Decoding takes memory for the whole photo, so only as many are decoded at once as there are
    // cores.
    class Turn
    {
    public:
        explicit Turn(Private &store);
        ~Turn();
        Turn(const Turn &) = delete;
        Turn &operator=(const Turn &) = delete;

    private:
        Private &mStore;
    };

    PictureFolder mFolder;
    std::mutex mMutex;
    std::map<std::string, std::shared_future<Answer>> mBeingMade; // by key
    std::condition_variable mTurnEnded;
    unsigned mFreeTurns = std::max(1u, std::thread::hardware_concurrency());
};

ThumbnailStore::Result ThumbnailStore::Private::picture(const std::string &sourcePath,
                                                        const std::string &key, int width)
{
    std::promise<Answer> promise;
    std::shared_future<Answer> answer;
    bool isFirst = false;
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        const auto [at, inserted] = mBeingMade.try_emplace(key);
        if (inserted)
            at->second = promise.get_future().share();
        answer = at->second;
        isFirst = inserted;
    }
    if (isFirst) {
        promise.set_value(findOrMake(sourcePath, key, width));
        const std::lock_guard<std::mutex> lock(mMutex);
        mBeingMade.erase(key);
    }
    return *answer.get();
}

ThumbnailStore::Private::Answer ThumbnailStore::Private::findOrMake(const std::string &sourcePath,
                                                                    const std::string &key,
                                                                    int width)
{
    auto result = std::make_shared<Result>();
    try {
        result->bytes = mFolder.find(key);
        result->mimeType = "image/jpeg";
        if (result->bytes.empty())
            *result = make(sourcePath, key, width);
    } catch (const std::exception &problem) { // memory or the file system gave out
        *result = {{}, {}, problem.what(), false};
    }
    return result;
}

ThumbnailStore::Result ThumbnailStore::Private::make(const std::string &sourcePath,
                                                     const std::string &key, int width)
{
    Result made;
    {
        const Turn turn(*this);
        made = makePicture(sourcePath, width);
    }
    if (made.ok() && !made.isOriginal)
        mFolder.keep(key, made.bytes);
    return made;
}

ThumbnailStore::Private::Turn::Turn(Private &store)
    : mStore(store)
{
    std::unique_lock<std::mutex> lock(mStore.mMutex);
    mStore.mTurnEnded.wait(lock, [this] { return mStore.mFreeTurns > 0; });
    --mStore.mFreeTurns;
}

ThumbnailStore::Private::Turn::~Turn()
{
    const std::lock_guard<std::mutex> lock(mStore.mMutex);
    ++mStore.mFreeTurns;
    mStore.mTurnEnded.notify_one();
}

ThumbnailStore::ThumbnailStore(std::string folder, std::int64_t maximumBytes)
    : d(std::make_unique<Private>(std::move(folder), maximumBytes))
{
}

ThumbnailStore::~ThumbnailStore() = default;

ThumbnailStore::Result ThumbnailStore::picture(const std::string &sourcePath,
                                               const std::string &identity, int width)
{
    const int asked = width == 0 ? 0 : std::clamp(width, 1, largestWidth);
    return d->picture(sourcePath, keyOf(identity, asked), asked);
}

#pragma once

#include <cstdint>
#include <map>
#include <set>
#include <string>
#include <vector>

struct nlmsghdr;

// A network interface whose cable was plugged in or out.
struct LinkChange
{
    std::string name;
    bool carrier;
};

// Which network interfaces have a carrier, learnt from the kernel's route messages. Works on bytes
// alone: whoever feeds it owns the socket.
class LinkTable
{
public:
    // What a list that is asked for answers to; the list is read by feeding the answers to read().
    void beginList(uint32_t sequence);

    enum class Outcome { Read, ListBroken };
    // Reads the messages in a buffer and adds each change of carrier to changes. Interfaces in the
    // first list are learnt without a change. ListBroken: the list must be asked for again.
    Outcome read(const void *data, size_t size, std::vector<LinkChange> *changes);

private:
    struct Link
    {
        std::string name;
        bool carrier;
    };

    Outcome readOne(const nlmsghdr *message, std::vector<LinkChange> *changes);
    void update(const nlmsghdr *message, bool listed, std::vector<LinkChange> *changes);
    void set(int index, const Link &link, std::vector<LinkChange> *changes);
    void remove(int index, std::vector<LinkChange> *changes);
    void endList(std::vector<LinkChange> *changes);

    std::map<int, Link> mLinks; // by interface index
    std::set<int> mListed;      // seen in the list that is being read
    uint32_t mSequence = 0;
    bool mLearnt = false; // the first list is complete
};

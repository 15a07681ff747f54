#include "platform/linktable.h"

#include <linux/if.h>
#include <linux/netlink.h>
#include <linux/rtnetlink.h>
#include <sys/socket.h>

#include <cstring>

namespace {

std::string nameOf(const nlmsghdr *message)
{
    const auto *info = static_cast<const ifinfomsg *>(NLMSG_DATA(message));
    int left = int(IFLA_PAYLOAD(message));
    for (const rtattr *attribute = IFLA_RTA(info); RTA_OK(attribute, left);
         attribute = RTA_NEXT(attribute, left)) {
        if (attribute->rta_type != IFLA_IFNAME)
            continue;
        const auto *text = static_cast<const char *>(RTA_DATA(attribute));
        return std::string(text, ::strnlen(text, RTA_PAYLOAD(attribute)));
    }
    return std::string();
}

} // namespace

void LinkTable::beginList(uint32_t sequence)
{
    mSequence = sequence;
    mListed.clear();
}

LinkTable::Outcome LinkTable::read(const void *data, size_t size, std::vector<LinkChange> *changes)
{
    bool broken = false;
    int left = int(size);
    for (auto *message = static_cast<const nlmsghdr *>(data); NLMSG_OK(message, left);
         message = NLMSG_NEXT(message, left))
        broken |= readOne(message, changes) == Outcome::ListBroken;
    return broken ? Outcome::ListBroken : Outcome::Read;
}

LinkTable::Outcome LinkTable::readOne(const nlmsghdr *message, std::vector<LinkChange> *changes)
{
    const bool listed = message->nlmsg_seq == mSequence && (message->nlmsg_flags & NLM_F_MULTI);
    if (listed && (message->nlmsg_flags & NLM_F_DUMP_INTR))
        return Outcome::ListBroken;
    switch (message->nlmsg_type) {
    case NLMSG_ERROR:
        return message->nlmsg_seq == mSequence ? Outcome::ListBroken : Outcome::Read;
    case NLMSG_DONE:
        if (listed)
            endList(changes);
        return Outcome::Read;
    case RTM_NEWLINK:
    case RTM_DELLINK:
        update(message, listed, changes);
        return Outcome::Read;
    default:
        return Outcome::Read;
    }
}

void LinkTable::update(const nlmsghdr *message, bool listed, std::vector<LinkChange> *changes)
{
    if (message->nlmsg_len < NLMSG_LENGTH(sizeof(ifinfomsg)))
        return;
    const auto *info = static_cast<const ifinfomsg *>(NLMSG_DATA(message));
    // Bridges speak of their ports in the same messages, under their own family.
    if (info->ifi_family != AF_UNSPEC || (info->ifi_flags & IFF_LOOPBACK))
        return;
    if (message->nlmsg_type == RTM_DELLINK) {
        remove(info->ifi_index, changes);
        return;
    }
    if (listed)
        mListed.insert(info->ifi_index);
    set(info->ifi_index, {nameOf(message), (info->ifi_flags & IFF_LOWER_UP) != 0}, changes);
}

void LinkTable::set(int index, const Link &link, std::vector<LinkChange> *changes)
{
    const auto known = mLinks.find(index);
    // An interface that appears while the program runs comes without a cable.
    const bool before = known != mLinks.end() ? known->second.carrier : !mLearnt && link.carrier;
    mLinks[index] = link;
    if (link.carrier != before)
        changes->push_back({link.name, link.carrier});
}

void LinkTable::remove(int index, std::vector<LinkChange> *changes)
{
    mListed.erase(index);
    const auto known = mLinks.find(index);
    if (known == mLinks.end())
        return;
    if (known->second.carrier)
        changes->push_back({known->second.name, false});
    mLinks.erase(known);
}

void LinkTable::endList(std::vector<LinkChange> *changes)
{
    std::vector<int> gone;
    for (const auto &[index, link] : mLinks) {
        if (!mListed.count(index))
            gone.push_back(index);
    }
    for (int index : gone)
        remove(index, changes);
    mLearnt = true;
}

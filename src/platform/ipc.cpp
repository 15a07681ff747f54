#include "platform/ipc.h"

#include "platform/shelllink.h"

namespace netcommon {

namespace {

Ipc *instance = nullptr;

} // namespace

Ipc *Ipc::getInstance()
{
    if (!instance)
        instance = new Ipc;
    return instance;
}

Ipc::Ipc()
    : mLink(ShellLink::shared())
{
}

Ipc::~Ipc()
{
    instance = nullptr;
}

bool Ipc::sendIpcMsg(const _NETWORK_MSG_T &message)
{
    return mLink->send(message);
}

void Ipc::requestExit(bool isSystemError)
{
    mLink->requestExit(isSystemError);
}

void Ipc::setSocketPath(const std::string &path)
{
    ShellLink::setSocketPath(path);
}

} // namespace netcommon

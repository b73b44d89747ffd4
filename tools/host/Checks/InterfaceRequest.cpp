#include "Checks/InterfaceRequest.h"

#include <cerrno>

#include <sys/ioctl.h>
#include <sys/socket.h>
#include <unistd.h>

namespace vantelhost {

InterfaceRequest::InterfaceRequest(const std::string& interface) {
    interface.copy(request_.ifr_name, sizeof(request_.ifr_name) - 1);
}

int InterfaceRequest::ask(unsigned long operation) {
    const int descriptor = ::socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0);
    if (descriptor < 0) {
        return errno;
    }
    const int error = ::ioctl(descriptor, operation, &request_) == 0 ? 0 : errno;
    ::close(descriptor);
    return error;
}

} // namespace vantelhost

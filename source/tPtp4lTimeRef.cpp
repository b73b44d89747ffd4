#include "tPtp4lTimeRef.h"

#include "errors/Exception.h"

namespace zekelVantel {

tPtp4lTimeRef::tPtp4lTimeRef(void** context, const std::string& protocolConfig) : host_(context) {
    readProtocolConfig(config_, protocolConfig);
}

void tPtp4lTimeRef::start() {
    zeerr::throwError({zeerr::code::resourceNotInitialized, "zeoskerr_resourceNotInitialized",
                       "tPtp4lTimeRef", __LINE__});
}

void tPtp4lTimeRef::stop() {
    zeerr::throwError({zeerr::code::resourceNotInitialized, "zeoskerr_resourceNotInitialized",
                       "tPtp4lTimeRef", __LINE__});
}

} // namespace zekelVantel

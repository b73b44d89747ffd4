/// @file
#pragma once

#include "Client.h"
#include "tGetDataFromPtp4l.h"

/// The plug-in's fetch, from the objects of which the library is linked: the library does not
/// export it.
class FetchClient : public Client {
public:
    explicit FetchClient(const std::string& daemon);

    void poll() override;

private:
    bool succeeds();

    zekelVantel::tGetDataFromPtp4l fetcher_;
};

#include "Setup.h"

#include "FileSink.h"
#include "StandardErrorSink.h"
#include "SystemLogSink.h"

namespace ZBLog {

namespace {

bool sameDestination(const ChannelConfiguration& one, const ChannelConfiguration& other) {
    return one.destination == other.destination && one.path == other.path;
}

std::shared_ptr<Sink> existingSink(const ChannelConfiguration& wanted, const Setup* setup) {
    if (setup == nullptr) return nullptr;
    for (std::size_t index = 0; index < channelCount; ++index) {
        if (sameDestination(wanted, setup->configuration.channels[index]) && setup->sinks[index]) {
            return setup->sinks[index];
        }
    }
    return nullptr;
}

std::shared_ptr<Sink> newSink(const ChannelConfiguration& wanted, Surroundings& surroundings) {
    switch (wanted.destination) {
        case Destination::nowhere:
            break;
        case Destination::standardError:
            return std::make_shared<StandardErrorSink>(surroundings);
        case Destination::systemLog:
            return std::make_shared<SystemLogSink>(surroundings);
        case Destination::file:
            return std::make_shared<FileSink>(wanted.path, surroundings);
    }
    return nullptr;
}

}  // namespace

std::unique_ptr<Setup> makeSetup(const Configuration& configuration, const Setup* former,
                                 Surroundings& surroundings) {
    auto setup = std::make_unique<Setup>();
    setup->configuration = configuration;
    for (std::size_t index = 0; index < channelCount; ++index) {
        const ChannelConfiguration& wanted = configuration.channels[index];
        std::shared_ptr<Sink> sink = existingSink(wanted, former);
        if (!sink) sink = existingSink(wanted, setup.get());
        setup->sinks[index] = sink ? std::move(sink) : newSink(wanted, surroundings);
    }
    return setup;
}

}  // namespace ZBLog

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
    for (const Channel channel : allChannels) {
        const std::shared_ptr<Sink>& sink = setup->sinks[indexOf(channel)];
        if (sink && sameDestination(wanted, setup->configuration.of(channel))) return sink;
    }
    return nullptr;
}

std::shared_ptr<Sink> newSink(const ChannelConfiguration& wanted, Surroundings& surroundings) {
    switch (wanted.destination) {
        case Destination::nowhere:
            return nullptr;
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
    for (const Channel channel : allChannels) {
        const ChannelConfiguration& wanted = configuration.of(channel);
        std::shared_ptr<Sink> sink = existingSink(wanted, former);
        if (!sink) sink = existingSink(wanted, setup.get());
        setup->sinks[indexOf(channel)] = sink ? std::move(sink) : newSink(wanted, surroundings);
    }
    return setup;
}

}  // namespace ZBLog

// All five conference-service sinks with every callback answering 0 and doing nothing: a base
// for hosts, tools and benchmarks that care about a few callbacks only.
#pragma once

#include "platform/arm_service.h"

class ArmNullSink : public IArmNodeControllerSink,
                    public IArmConferenceSink,
                    public IArmApeSink,
                    public IArmSharedDataSink,
                    public IArmAllocHandleSink {
public:
    virtual ~ArmNullSink() = default;

    int ConnectConfirm(short, std::uint32_t) override { return 0; }
    int DisconnectIndication(short) override { return 0; }
    int TransportStatusIndication(std::uint32_t) override { return 0; }
    int DisconnectConfirm(short) override { return 0; }

    int ConferenceJoinConfirm(std::uint16_t, const char*, short, std::uint32_t) override {
        return 0;
    }
    int ConferenceLeaveIndication(std::uint16_t, short) override { return 0; }
    int ConferenceRosterConfirm(std::uint16_t, short) override { return 0; }
    int ConferenceRosterChanged(std::uint16_t, std::uint32_t) override { return 0; }
    int ApeRosterConfirm(std::uint16_t, short) override { return 0; }
    int ApeRosterChanged(std::uint16_t, std::uint32_t) override { return 0; }

    int ApeAttachConfirm(std::uint32_t, short, std::uint32_t) override { return 0; }
    int ApeEnrollConfirm(std::uint32_t, short, short, ARMSessionResource*) override { return 0; }
    int ApeDataIndication(std::uint32_t, std::uint32_t, std::uint32_t, std::uint16_t, const void*,
                          std::uint32_t) override {
        return 0;
    }
    int ApeBufferFullIndication(std::uint32_t) override { return 0; }
    int TokenGrabConfirm(std::uint32_t, std::uint32_t, short) override { return 0; }
    int TokenInhibitConfirm(std::uint32_t, std::uint32_t, short) override { return 0; }
    int TokenGiveIndication(std::uint32_t, std::uint32_t, std::uint32_t) override { return 0; }
    int TokenGiveConfirm(std::uint32_t, std::uint32_t, short) override { return 0; }
    int TokenPleaseIndication(std::uint32_t, std::uint32_t, std::uint32_t) override { return 0; }
    int TokenReleaseConfirm(std::uint32_t, std::uint32_t, short) override { return 0; }
    int TokenTestConfirm(std::uint32_t, std::uint32_t, std::uint32_t) override { return 0; }
    int ApeRosterInquireConfirm(std::uint32_t, short) override { return 0; }
    int ApeRosterRefreshConfirm(std::uint32_t, short) override { return 0; }
    int ApeRosterReportIndication(std::uint32_t, std::uint32_t) override { return 0; }
    int ApeRosterChanged(std::uint32_t, std::uint16_t, std::uint32_t, std::uint32_t, std::uint32_t,
                         ARMApeRoster*) override {
        return 0;
    }
    int ApeDetachIndication(std::uint32_t, short) override { return 0; }
    int ApeDataIndicationEx(std::uint32_t, std::uint32_t, const void*, std::uint32_t) override {
        return 0;
    }
    int ApeCacheActionConfirmEx(std::uint32_t, std::uint32_t, tagCacheAction, std::uint32_t,
                                std::uint32_t, short) override {
        return 0;
    }

    int SharedDataReceived(std::uint32_t, std::uint32_t, std::uint32_t, short) override {
        return 0;
    }
    int SharedDataReceivedEx(std::uint32_t, std::uint32_t, std::uint32_t, std::uint32_t, short,
                             tagCacheAction, std::uint32_t, std::uint32_t, std::uint16_t) override {
        return 0;
    }

    int AllocHandleConfirm(std::uint32_t, std::uint32_t, short) override { return 0; }
    int AllocNameHandleConfirm(std::uint32_t, std::uint32_t, NameHandle*, short,
                               std::uint32_t) override {
        return 0;
    }
};

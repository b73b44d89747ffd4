// What it costs to write one request and to read one answer, for each data set. The cost of a fresh
// buffer is part of both, as it is of every exchange; the first two say how much that is.

#include <benchmark/benchmark.h>

#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tPtpMgmtMsg.h"

namespace {

using namespace zekelVantel;

void countOctets(benchmark::State& state, const tMsgBuffer& buffer) {
    state.SetBytesProcessed(state.iterations() * std::int64_t{buffer.getLength()});
}

void clearBuffer(benchmark::State& state) {
    tMsgBuffer buffer;
    for (auto _ : state) {
        buffer.clear();
        benchmark::DoNotOptimize(buffer.data());
        benchmark::ClobberMemory();
    }
}
BENCHMARK(clearBuffer);

void copyBuffer(benchmark::State& state) {
    const tMsgBuffer source;
    tMsgBuffer buffer;
    for (auto _ : state) {
        buffer = source;
        benchmark::DoNotOptimize(buffer.data());
        benchmark::ClobberMemory();
    }
}
BENCHMARK(copyBuffer);

void encodeMessage(benchmark::State& state) {
    const tPtpMgmtMsg message;
    zeerr::LocalStatus status;
    tMsgBuffer buffer;
    for (auto _ : state) {
        buffer.clear();
        message.serialize(buffer, status);
        benchmark::DoNotOptimize(buffer.data());
        benchmark::ClobberMemory();
    }
    countOctets(state, buffer);
}
BENCHMARK(encodeMessage);

void decodeMessage(benchmark::State& state) {
    zeerr::LocalStatus status;
    tMsgBuffer answer;
    tPtpMgmtMsg message;
    message.serialize(answer, status);
    for (auto _ : state) {
        tMsgBuffer buffer = answer;
        message.deserialize(buffer, status);
        benchmark::DoNotOptimize(message);
        benchmark::ClobberMemory();
    }
    countOctets(state, answer);
}
BENCHMARK(decodeMessage);

template <typename Tlv>
void encode(benchmark::State& state) {
    const tPtpMgmtMsg message;
    const Tlv tlv;
    zeerr::LocalStatus status;
    tMsgBuffer buffer;
    for (auto _ : state) {
        buffer.clear();
        message.serialize(buffer, status);
        tlv.serialize(buffer, status);
        benchmark::DoNotOptimize(buffer.data());
        benchmark::ClobberMemory();
    }
    countOctets(state, buffer);
}

template <typename Tlv>
void decode(benchmark::State& state) {
    zeerr::LocalStatus status;
    tMsgBuffer answer;
    tPtpMgmtMsg message;
    Tlv tlv;
    message.serialize(answer, status);
    tlv.serialize(answer, status);
    for (auto _ : state) {
        tMsgBuffer buffer = answer;
        message.deserialize(buffer, status);
        tlv.deserialize(buffer, status);
        benchmark::DoNotOptimize(message);
        benchmark::DoNotOptimize(tlv);
        benchmark::ClobberMemory();
    }
    if (zeerr::isError(status)) {
        state.SkipWithError("the answer was not understood");
    }
    countOctets(state, answer);
}

BENCHMARK_TEMPLATE(encode, tPtp4lTimeStatusMgmtTlv);
BENCHMARK_TEMPLATE(encode, tPtp4lParentDataSetMgmtTlv);
BENCHMARK_TEMPLATE(encode, tPtp4lDefaultDataSetMgmtTlv);
BENCHMARK_TEMPLATE(encode, tPtp4lPortDataSetMgmtTlv);
BENCHMARK_TEMPLATE(encode, tPtp4lPortDataSetNpMgmtTlv);
BENCHMARK_TEMPLATE(encode, tPtp4lPortPropertiesMgmtTlv);
BENCHMARK_TEMPLATE(decode, tPtp4lTimeStatusMgmtTlv);
BENCHMARK_TEMPLATE(decode, tPtp4lParentDataSetMgmtTlv);
BENCHMARK_TEMPLATE(decode, tPtp4lDefaultDataSetMgmtTlv);
BENCHMARK_TEMPLATE(decode, tPtp4lPortDataSetMgmtTlv);
BENCHMARK_TEMPLATE(decode, tPtp4lPortDataSetNpMgmtTlv);
BENCHMARK_TEMPLATE(decode, tPtp4lPortPropertiesMgmtTlv);

} // namespace

#include <oecore/core/event.h>

#include <gtest/gtest.h>

#include <stdexcept>
#include <vector>

namespace {

struct Sender {
    static OmbEventHandler<Sender, OmbErrorEventArgs> errorEvent;
};
OmbEventHandler<Sender, OmbErrorEventArgs> Sender::errorEvent;

std::vector<int> calls;
const Sender* lastSender = nullptr;

void first(Sender* s, const OmbErrorEventArgs&) {
    calls.push_back(0);
    lastSender = s;
}
void second(Sender*, const OmbErrorEventArgs& a) { calls.push_back(a.message == OmbString("boom") ? 1 : -1); }
void throwing(Sender*, const OmbErrorEventArgs&) { throw std::runtime_error("handler failed"); }

}  // namespace

TEST(Event, SlotsRunInOrderAndEmptySlotsAreSkipped) {
    calls.clear();
    Sender sender;
    Sender::errorEvent.slots[0] = first;
    Sender::errorEvent.slots[1] = nullptr;
    Sender::errorEvent.slots[2] = second;
    Sender::errorEvent.raise(&sender, OmbErrorEventArgs{OmbString("boom")});
    EXPECT_EQ(calls, (std::vector<int>{0, 1}));
    EXPECT_EQ(lastSender, &sender);
}

TEST(Event, AThrowingHandlerStopsTheRestAndNeverEscapes) {
    calls.clear();
    Sender::errorEvent.slots[0] = throwing;
    Sender::errorEvent.slots[1] = first;
    Sender::errorEvent.slots[2] = second;
    EXPECT_NO_THROW(Sender::errorEvent.raise(nullptr, OmbErrorEventArgs{}));
    EXPECT_TRUE(calls.empty());
    Sender::errorEvent = {};
}

// The queue as its contract says, against a player system that breaks the rules.
#include <errno.h>
#include <stdlib.h>

#include <thread>

#include "Process.h"
#include "TempFolder.h"
#include "player/NetworkStub.h"

namespace {

class QueueTest : public testing::Test {
protected:
    QueueTest()
    {
        setenv("ZV_IPC_SOCKET", (m_Folder / "player").c_str(), 1);
        EXPECT_EQ(0, init_network_msg_queue());
        m_Player.Accept();
    }
    ~QueueTest() override
    {
        uninit_network_msg_queue();
        unsetenv("ZV_IPC_SOCKET");
    }

    static std::string Received()
    {
        NETWORK_MSG_STUB_MESSAGE message;
        const int error = network_stub_recv_ipc_msg(&message);
        return error ? strerror(error) : std::to_string(message.type) + " " + std::to_string(message.words[2]);
    }
    static int Send()
    {
        const NETWORK_MSG_STUB_MESSAGE message = {5, {1, 2, 0x01020304}};
        return network_stub_send_ipc_msg(&message);
    }

    TempFolder m_Folder;
    Player m_Player{m_Folder / "player"};
};

TEST_F(QueueTest, WordsAreLittleEndian)
{
    EXPECT_EQ(0, Send());
    EXPECT_EQ(std::string("\5\0\0\0\1\0\0\0\2\0\0\0\4\3\2\1", 16), m_Player.Receive());
    m_Player.SendBytes(std::string("\1\2\0\0\0\0\0\0\0\0\0\0\0\0\1\0", 16));
    EXPECT_EQ("513 65536", Received());
}

TEST_F(QueueTest, MessagesSentBeforeThePlayerWentArrive)
{
    m_Player.SendBytes("");
    m_Player.SendBytes("");
    m_Player.Send(7);
    m_Player.SendBytes("");
    m_Player.Close();
    EXPECT_EQ("7 0", Received());
    EXPECT_EQ(strerror(ECONNRESET), Received());
    EXPECT_EQ(EPIPE, Send());
}

TEST_F(QueueTest, FullQueueDoesNotBlock)
{
    int error = 0;
    while (error == 0) {
        error = Send();
    }
    EXPECT_EQ(EAGAIN, error);
    EXPECT_EQ(16u, m_Player.Receive().size());
    EXPECT_EQ(0, Send());
}

// Whether or not it blocks already when the queue is closed.
TEST_F(QueueTest, ClosingEndsAReceive)
{
    for (int round = 0; round < 20; ++round) {
        std::thread receiver([] { EXPECT_EQ(strerror(ENOTCONN), Received()); });
        if (round % 2 == 0) std::this_thread::yield();
        uninit_network_msg_queue();
        receiver.join();
        EXPECT_EQ(ENOTCONN, Send());
        ASSERT_EQ(0, init_network_msg_queue());
        m_Player.Close();
        m_Player.Accept();
    }
}

TEST_F(QueueTest, OpensOnceAtATime)
{
    EXPECT_EQ(EALREADY, init_network_msg_queue());
    uninit_network_msg_queue();
    uninit_network_msg_queue();
    setenv("ZV_IPC_SOCKET", std::string(200, 'x').c_str(), 1);
    EXPECT_EQ(ENAMETOOLONG, init_network_msg_queue());
    EXPECT_EQ(strerror(ENOTCONN), Received());
}

}  // namespace

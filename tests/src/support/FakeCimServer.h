#ifndef TESTS_SRC_SUPPORT_FAKECIMSERVER_H
#define TESTS_SRC_SUPPORT_FAKECIMSERVER_H

#include <condition_variable>
#include <map>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

namespace NKOLVRX20 {

// A CIM server on a loopback port that answers from a script. It has its port from the start, but refuses connections
// until Listen.
// A request is named by its operation and object: "GetClass CIM_Foo", "GetQualifier Key", "EnumerateInstances CIM_Foo".
// What is not in the script is answered with CIM error 6.
// Thread: safe.
class TFakeCimServer
{
  public:
    TFakeCimServer();
    ~TFakeCimServer();

    TFakeCimServer(const TFakeCimServer&) = delete;
    TFakeCimServer& operator=(const TFakeCimServer&) = delete;

    unsigned short Port() const { return fPort; }
    void Listen();
    // Refuses further connections; those that stand go on.
    void Refuse();

    // The content of the answer's IRETURNVALUE.
    void Answer(const std::string& request, const std::string& returnValue);
    // A class without elements of its own, or with these.
    void AnswerClass(const std::string& name, const std::string& superClass, const std::string& elements = "");
    // The whole answer, byte for byte; then the connection is closed.
    void AnswerRaw(const std::string& request, const std::string& bytes);
    // Never answers.
    void KeepSilentOn(const std::string& request);

    // Blocks: until all connections have ended, five seconds at most.
    void WaitUntilIdle() const;
    void ForgetRequests();
    std::vector<std::string> Requests() const;
    // Returns: how often this was asked.
    long Count(const std::string& request) const;
    // Returns: the body of the last request of that name.
    std::string LastBody(const std::string& request) const;

  private:
    struct TReply
    {
        enum EKind
        {
            kReturnValue,
            kRaw,
            kSilence
        } fKind;
        std::string fText;
    };
    struct TConnection
    {
        int fDescriptor;
        std::string fReceived;
    };

    void BindListener();
    void Wish(char wish);
    void Grant(char wish);
    void Serve();
    void CountConnections();
    void Accept();
    bool Receive(TConnection& connection);
    bool Respond(int descriptor, const std::string& body);

    int fListener = -1;
    bool fIsListening = false; // the thread's own
    int fWishes = 0;
    int fWakeUp[2] = {-1, -1};
    unsigned short fPort = 0;
    mutable std::mutex fMutex;
    std::map<std::string, TReply> fReplies;
    std::vector<std::pair<std::string, std::string>> fRequests; // name and body
    std::vector<TConnection> fConnections;                      // the thread's own
    int fConnectionCount = 0;
    mutable std::condition_variable fChanged;
    std::thread fThread;
};

} // namespace NKOLVRX20

#endif

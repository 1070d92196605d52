// What the head of a service's answer says besides its contents: that there is an answer, and how long the service
// wants to be left alone ("Retry-After" of an HTTP 503). Whoever asks a service unbidden goes by it.
#pragma once

/// Of one transport, and used like it by one thread at a time.
class RetryAfter {
public:
    /// Of the last exchange since it was taken; all false when none was made, as for an answer from the cache.
    struct Heard {
        bool answered = false;     ///< An answer came, whatever it says.
        bool silent = false;       ///< None came.
        bool unavailable = false;  ///< It is an HTTP 503.
        unsigned int seconds = 0;  ///< Its Retry-After. 0: none, or a date: the player's clock may be wrong.
    };

    /// A request is about to be sent.
    void Begin();
    /// A header line of an answer with that HTTP status.
    void ReadHeader(int status, const char* name, const char* value);
    /// The head of an answer: the bytes from its status line on.
    void ReadHead(const char* head);

    /// What was heard since the last time.
    Heard Take();

    /// The seconds that a header's text stands for; 0 when it is no number of them.
    static unsigned int SecondsOf(const char* text);

private:
    void Answered(int status);

    Heard m_Heard;
};

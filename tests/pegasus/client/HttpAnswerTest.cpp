// SPDX-License-Identifier: MIT
// The HTTP parts that client and server share: the reader of answers, and the check of a Content-Type.
#include "pegasus/wire/ContentType.h"
#include "pegasus/wire/HttpAnswerReader.h"

#include <gtest/gtest.h>

namespace Pegasus::wire {
namespace {

const std::string kHead = "HTTP/1.1 200 OK\r\nCIMOperation: MethodResponse\r\n";
const std::string kChunked = kHead + "Transfer-Encoding: chunked\r\n\r\n";

HttpAnswerLimits smallLimits()
{
    HttpAnswerLimits limits;
    limits.maxHeaderBytes = 200;
    limits.maxFramingBytes = 100;
    limits.maxBodyBytes = 20;
    return limits;
}

// What a user of the reader sees, fed in pieces of `pieceBytes`.
std::string read(std::string_view bytes, std::size_t pieceBytes)
{
    std::string out;
    HttpAnswerReader reader(
        smallLimits(), [&](const HttpAnswerFields& fields) { out += std::to_string(fields.status) + "|"; },
        [&](std::string_view body) { out += body; });
    try {
        for (std::size_t at = 0; at < bytes.size(); at += pieceBytes) {
            reader.feed(bytes.substr(at, pieceBytes));
        }
        if (!reader.endOfConnection()) {
            return out + "|incomplete";
        }
    } catch (const HttpAnswerError& error) {
        return std::string("malformed ") + error.what();
    }
    const HttpAnswerFields& fields = reader.fields();
    return out + "|" + fields.statusCode.value_or("-") + "|" + fields.statusDescription + fields.cimError +
           fields.errorDetail + (reader.keepsAlive() ? "|keep" : "|close");
}

TEST(HttpAnswerReaderTest, ReadsTheSameHoweverTheBytesArrive)
{
    struct Row
    {
        const char* name;
        std::string bytes;
        std::string seen;
    };
    const std::string longExtension = ";x=" + std::string(120, 'y');
    const Row rows[] = {
        {"length", kHead + "Content-Length: 3\r\n\r\nabc", "200|abc|-||keep"},
        {"bare line feeds in the head", "HTTP/1.1 200 OK\nContent-Length: 3\n\nabc", "200|abc|-||keep"},
        {"no length", kHead + "\r\nabc", "200|abc|-||close"},
        {"chunks and trailer",
         kChunked + "3;x=y\r\nabc\r\n2\r\nde\r\n0\r\nCIMStatusCode: 6\r\nCIMStatusCodeDescription: not%20there\r\n\r\n",
         "200|abcde|6|not there|keep"},
        {"error", "HTTP/1.1 400 Bad\r\nCIMError: x\r\nPGErrorDetail: %3Cy%3E\r\nContent-Length: 0\r\n\r\n",
         "400||-|x<y>|keep"},
        {"the answer to an M-POST", "HTTP/1.1 400 Bad\r\n73-CIMError: x\r\nContent-Length: 0\r\n\r\n", "400||-|x|keep"},
        {"bytes after it", kHead + "Content-Length: 1\r\n\r\nabc", "200|a|-||close"},
        {"cut in the body", kHead + "Content-Length: 3\r\n\r\nab", "200|ab|incomplete"},
        {"cut after the last chunk's line", kChunked + "0\r\nX", "200||incomplete"},
        {"cut in the trailer", kChunked + "1\r\na\r\n0\r\nX: y\r\n", "200|a|incomplete"},
        {"cut in the head", kHead, "|incomplete"},
        {"not HTTP", "SSH-2.0-x\r\n", "malformed "},
        {"no status", "HTTP/1.1\r\n\r\n", "malformed "},
        {"bad chunk size", kChunked + "g\r\n", "malformed "},
        {"long head", kHead + "X: " + std::string(300, 'y'), "malformed a header of more than 200 bytes"},
        {"long extension", kChunked + "1" + longExtension + "\r\na\r\n0\r\n\r\n",
         "malformed chunk framing of more than 100 bytes"},
        {"endless extension", kChunked + "1" + longExtension, "malformed chunk framing of more than 100 bytes"},
        {"endless trailer", kChunked + "0\r\nX: " + std::string(120, 'y'),
         "malformed chunk framing of more than 100 bytes"},
        {"long trailer", kChunked + "0\r\nX: " + std::string(60, 'y') + "\r\nX: " + std::string(60, 'y') + "\r\n\r\n",
         "malformed chunk framing of more than 100 bytes"},
        {"framing at the limit", kChunked + "1;x=" + std::string(94, 'y') + "\r\na\r\n0\r\n\r\n", "200|a|-||keep"},
        {"framing beyond it", kChunked + "1;x=" + std::string(95, 'y') + "\r\na\r\n0\r\n\r\n",
         "malformed chunk framing of more than 100 bytes"},
        {"long body", kHead + "Content-Length: 21\r\n\r\n", "malformed a body of more than 20 bytes"},
        {"long body in chunks", kChunked + "14\r\n01234567890123456789\r\n1\r\n0\r\n0\r\n\r\n",
         "malformed a body of more than 20 bytes"},
        {"long body without length", kHead + "\r\n" + std::string(21, 'x'), "malformed a body of more than 20 bytes"},
    };
    for (const Row& row : rows) {
        for (const std::size_t piece : {row.bytes.size(), std::size_t(1), std::size_t(7)}) {
            EXPECT_EQ(read(row.bytes, piece), row.seen) << row.name << " in pieces of " << piece;
        }
    }
}

TEST(ContentTypeTest, XmlInUtf8)
{
    struct Row
    {
        std::string type;
        bool isAccepted;
    };
    const Row rows[] = {
        {"application/xml; charset=utf-8", true},
        {"text/xml;charset=\"UTF-8\"", true},
        {" \"Application/XML\" ; Charset = utf-8\t", true},
        {"application/xml", true},
        {"text/xml ", true},
        {"", false},
        {"text/html; charset=utf-8", false},
        {"application/xmlx", false},
        {"application/xml; charset=utf-16", false},
        {"application/xml; charset=utf-8; q=1", false},
        {"application/xml; q=1", false},
        {"application/xml; charset=", false},
        {"application/xml; charset", false},
        {"application/xml;", false},
        {"application/xml charset=utf-8", false},
        {"application/xml; charset=\"utf-8", true}, // the quote may be missing at the end
    };
    for (const Row& row : rows) {
        EXPECT_EQ(isXmlInUtf8(row.type), row.isAccepted) << row.type;
    }
}

} // namespace
} // namespace Pegasus::wire

// board serve PORTFILE CLIENTS: serves until so many clients have left, and shows the board as JSON.
// board post PORTFILE AUTHOR TEXT...: posts each text, and leaves.
@import "board.h"
@import "Vesk/vxObject/Json.h"
@import "Vesk/vxObject/SocketChannel.h"

#include <cstdio>
#include <fstream>
#include <string>
#include <thread>

vxDefineTarget(board, 1)
void Register_Project_board();

namespace board
{

$class+ Board isa IBoard
{
public:
    Board() : left(0) {}
    void Post(const Note& note, int32& count)
    {
        if (note.text.empty()) throw std::invalid_argument("an empty note");
        notes.push_back(note);
        count = int32(notes.size());
    }
    void Notes(const vesk::string8& author, vesk::xvector<Note>& found)
    {
        for (Note const& note : notes)
        {
            if (note.author == author) found.push_back(note);
        }
    }
    void Leave() { ++left; }

    $xvector<Note> notes;
    int32 left;
};

int Serve(std::string const& portFile, int clients)
{
    Board board;
    vesk::SocketServer server(0, [&board](vesk::Server& client) { client.Export(vesk::ptr<IBoard>(&board)); });
    server.OnError([](std::string const& error) { vesk::xout() << "refused: " << error << '\n'; });
    std::ofstream(portFile + ".new") << server.Port();
    std::rename((portFile + ".new").c_str(), portFile.c_str());
    const auto end = std::chrono::steady_clock::now() + std::chrono::minutes(1);
    server.ServeUntil([&] { return board.left == clients || std::chrono::steady_clock::now() > end; });
    vesk::JsonStyle style;
    style.m_indent = 2;
    vesk::xout() << vesk::ToJsonText(board, style) << '\n';
    return board.left == clients ? 0 : 1;
}

// Waits for the server's port.
int PortOf(std::string const& portFile)
{
    for (int i = 0; i < 100; ++i)
    {
        int port = 0;
        if (std::ifstream(portFile) >> port) return port;
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
    }
    throw vesk::RemoteError("no server");
}

int Post(std::string const& portFile, vesk::string8 const& author, int count, char** texts)
{
    const auto channel = vesk::SocketChannel::Connect("127.0.0.1", vesk::uint16(PortOf(portFile)));
    vesk::ClientConnection connection(*channel);
    const auto stub = vesk::Import<IBoard>(connection, 1);
    const vesk::ptr<IBoard> board(stub->Interface());
    for (int i = 0; i < count; ++i)
    {
        Note note;
        note.author = author;
        note.text = texts[i];
        try
        {
            vesk::int32 total = 0;
            board->Post(note, total);
        }
        catch (vesk::RemoteError const& error)
        {
            vesk::xout() << author << " was refused: " << error.what() << '\n';
        }
    }
    vesk::xvector<Note> notes;
    board->Notes(author, notes);
    vesk::xout() << author << " has " << notes.size() << " notes on the board\n";
    board->Leave();
    return 0;
}

}

int main(int argc, char** argv)
{
    Register_Project_board();
    const std::string mode = argc > 3 ? argv[1] : "";
    try
    {
        if (mode == "serve") return board::Serve(argv[2], std::stoi(argv[3]));
        if (mode == "post") return board::Post(argv[2], std::string(argv[3]), argc - 4, argv + 4);
    }
    catch (std::exception const& error)
    {
        vesk::xout() << "board: " << error.what() << '\n';
        return 1;
    }
    vesk::xout() << "board serve PORTFILE CLIENTS | board post PORTFILE AUTHOR TEXT...\n";
    return 2;
}

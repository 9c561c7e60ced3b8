@import "note.h"

#include <cstdio>

// What a program of that release wrote: its number, then the fields that the model had then.
template <typename... Fields>
vesk::xvector<vesk::octet_t> WrittenBy(int release, Fields const&... fields)
{
    vesk::Archive ar;
    vesk::SerialiseVariableLengthUint(ar, release);
    (ar << ... << fields);
    return ar.m_bytes;
}

void Show(char const* title, vesk::xvector<vesk::octet_t> bytes)
{
    vesk::InputArchive ar(bytes);
    Page page;
    page.Deserialise(ar);
    Note const& note = page.read();
    std::printf("%s: \"%s\", %lld ms, %d words, tags:", title, note.text.c_str(), static_cast<long long>(note.milliseconds),
                static_cast<int>(note.words));
    for (vesk::string8 const& tag : note.tags) std::printf(" %s", tag.c_str());
    std::printf("\n");
}

int main()
{
    const vesk::string8 text = "call the harbour";
    Show("release 1", WrittenBy(1, text, vesk::int32(90), true));
    Show("release 2", WrittenBy(2, text, vesk::int32(90), vesk::xvector<vesk::string8>{"sea", "today"}));

    Page page;
    page.text = "two words";
    page.milliseconds = 1500;
    page.words = 2;
    page.tags.push_back("new");
    vesk::Archive ar;
    page.Serialise(ar);
    Show("release 3", ar.m_bytes);
}

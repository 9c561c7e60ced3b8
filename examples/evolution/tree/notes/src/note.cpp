@import "note.h"

vxDefineTarget(notes, 3)

vesk::int32 CountWords(vesk::string8 const& text)
{
    vesk::int32 words = 0;
    bool inWord = false;
    for (char c : text)
    {
        if (c != ' ' && !inWord) ++words;
        inWord = c != ' ';
    }
    return words;
}

@import "Vesk/vxObject/IObject.h"

vesk::int32 CountWords(vesk::string8 const& text);

// A note as archives hold it. The first release kept the time in seconds and marked urgent notes; since the second, notes
// have tags, and since the third the time is in milliseconds. Archives of all three can be read.
$model Note
{
    assignable<string8> text;
    xvector<string8> tags;
    int64 milliseconds;
    int32 words;

    $dropped
    {
        int32 seconds;
        bool urgent;
    }
    $schema
    {
        1: +text +seconds +urgent
        2: -urgent +tags
        3: -seconds +milliseconds +words
    }
    $evolve
    {
        tags(urgent)
        {
            if (urgent) tags.push_back("urgent");
        }
        milliseconds(seconds) { milliseconds = vesk::int64(seconds) * 1000; }
        words(text) { words = CountWords(text); }
    }
};

// Its archives begin with the number of the release that wrote them.
$class Page : model Note
{
};
